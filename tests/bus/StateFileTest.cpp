#include "service/StateFile.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>

#include "support/RecordingSink.h"

namespace qel::service {
namespace {

namespace fs = std::filesystem;

class StateFileTest : public ::testing::Test {
 protected:
  StateFileTest() { fs::create_directory(directory); }
  ~StateFileTest() override { fs::remove_all(directory); }

  testing::CapturedSystemLog log;
  const std::string directory =
      (fs::temp_directory_path() / ("qelstate" + std::to_string(::getpid())));
  const KeptState state{{{2, Bytes{1, 2, 3}}, {-7, Bytes{}}}, {{"qelwatch", 2}, {"other", -7}}};
};

TEST_F(StateFileTest, givesBackWhatWasSavedLast) {
  StateFile file(directory);
  file.save(KeptState{});
  file.save(state);
  EXPECT_EQ(StateFile(directory).load(), state);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(StateFileTest, hasNothingAtFirst) { EXPECT_EQ(StateFile(directory).load(), KeptState()); }

TEST_F(StateFileTest, isForItsOwnerOnly) {
  StateFile(directory).save(state);
  EXPECT_EQ(fs::status(directory + "/state").permissions(),
            fs::perms::owner_read | fs::perms::owner_write);
}

TEST_F(StateFileTest, isNotDisturbedByAnUnfinishedWrite) {
  StateFile file(directory);
  file.save(state);
  std::ofstream(directory + "/state.new") << "half";
  EXPECT_EQ(file.load(), state);
}

TEST_F(StateFileTest, ignoresAndReportsWhatIsNoState) {
  std::ofstream(directory + "/state") << "nonsense";
  EXPECT_EQ(StateFile(directory).load(), KeptState());
  ASSERT_EQ(log.lines().size(), 1U);
  EXPECT_NE(log.lines()[0].find("not a state of this service"), std::string::npos);
}

TEST_F(StateFileTest, reportsThatItCannotBeWritten) {
  StateFile(directory + "/missing").save(state);
  ASSERT_EQ(log.lines().size(), 1U);
  EXPECT_NE(log.lines()[0].find("cannot be written: No such file or directory"), std::string::npos);
}

// The reason alone, of the one line in the log.
std::string onlyLine(const testing::CapturedSystemLog& log) {
  return log.lines().size() == 1 ? log.lines()[0] : std::to_string(log.lines().size()) + " lines";
}

// Reading one ended the service.
TEST_F(StateFileTest, isNoDirectory) {
  fs::create_directory(directory + "/state");
  EXPECT_EQ(StateFile(directory).load(), KeptState());
  EXPECT_EQ(onlyLine(log), "basebandd: " + directory + "/state: not a regular file, ignored");
}

// Opening one waited for ever.
TEST_F(StateFileTest, isNoFifo) {
  ASSERT_EQ(::mkfifo((directory + "/state").c_str(), 0600), 0);
  EXPECT_EQ(StateFile(directory).load(), KeptState());
  EXPECT_EQ(onlyLine(log), "basebandd: " + directory + "/state: not a regular file, ignored");
}

// These were taken for a service without a past, without a word.
TEST_F(StateFileTest, saysThatItCannotBeRead) {
  fs::create_symlink("/proc/self/mem", directory + "/state");
  EXPECT_EQ(StateFile(directory).load(), KeptState());
  EXPECT_EQ(onlyLine(log),
            "basebandd: " + directory + "/state: cannot be read: Input/output error");
}

TEST_F(StateFileTest, saysThatItCannotBeOpened) {
  fs::create_symlink(directory + "/state", directory + "/state");
  EXPECT_EQ(StateFile(directory).load(), KeptState());
  EXPECT_NE(onlyLine(log).find("/state: cannot be read: Too many levels"), std::string::npos);
}

// A file of any size was read whole.
TEST_F(StateFileTest, isNotReadBeyondTheLargestState) {
  std::ofstream(directory + "/state") << "x";
  fs::resize_file(directory + "/state", std::uintmax_t{1} << 40);
  EXPECT_EQ(StateFile(directory).load(), KeptState());
  EXPECT_NE(onlyLine(log).find("larger than any state of this service"), std::string::npos);
}

TEST_F(StateFileTest, isNotWrittenBeyondTheLargestState) {
  StateFile file(directory);
  file.save(state);
  KeptState large = state;
  large.configurations[3] = Bytes(StateFile::kLargest);
  file.save(large);
  EXPECT_NE(onlyLine(log).find("cannot be written: File too large"), std::string::npos);
  EXPECT_EQ(file.load(), state);
}

TEST_F(StateFileTest, replacesWhateverLiesInItsWay) {
  ASSERT_EQ(::mkfifo((directory + "/state").c_str(), 0600), 0);
  ASSERT_EQ(::mkfifo((directory + "/state.new").c_str(), 0600), 0);
  StateFile file(directory);
  file.save(state);
  EXPECT_EQ(file.load(), state);
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(StateFileTest, saysOnceThatItCannotBeReplaced) {
  fs::create_directory(directory + "/state");
  StateFile file(directory);
  file.save(state);
  file.save(KeptState{});
  EXPECT_NE(onlyLine(log).find("cannot be replaced: Is a directory"), std::string::npos);
  fs::remove(directory + "/state");
  file.save(state);
  fs::remove(directory + "/state");
  fs::create_directory(directory + "/state");
  file.save(state);
  EXPECT_EQ(log.lines().size(), 2U) << "a failure after a success is news";
}

}  // namespace
}  // namespace qel::service
