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

}  // namespace
}  // namespace qel::service
