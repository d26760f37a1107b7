#include "recording/RotatingRecording.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "recording/RecordingReader.h"

namespace qel {
namespace {

namespace fs = std::filesystem;
using namespace std::chrono_literals;
using Existing = RotatingRecording::Existing;

constexpr RotatingRecording::TimePoint kStart{1000s};

RecordedEvent event(std::uint64_t timeMs) {
  return {timeMs, RecordedKind::trigger, {{"kKeyTriggerID", std::int64_t{8323091}}}};
}

class RotatingRecordingTest : public ::testing::Test {
 protected:
  RotatingRecordingTest() {
    std::string pattern = (fs::temp_directory_path() / "qelrotate-XXXXXX").string();
    directory = ::mkdtemp(pattern.data());
    path = directory + "/drive.jsonl";
    limits.freeBytes = 0;
  }
  ~RotatingRecordingTest() override { fs::remove_all(directory); }

  std::unique_ptr<RotatingRecording> create(Existing existing = Existing::refused) {
    return RotatingRecording::create(path, limits, existing, kStart, error);
  }
  void put(const std::string& suffix) const { std::ofstream(path + suffix) << "old\n"; }
  bool exists(const std::string& suffix) const { return fs::exists(path + suffix); }

  // The times of the file's events.
  std::vector<std::uint64_t> timesOf(const std::string& suffix) const {
    RecordingFault fault;
    const auto reader =
        RecordingReader::open(path + suffix, RecordingReader::BadLines::fail, fault);
    std::vector<std::uint64_t> times;
    if (!reader) return times;
    while (const auto read = reader->next()) times.push_back(read->timeMs);
    return times;
  }

  std::string directory;
  std::string path;
  RecordingLimits limits;
  std::string error;
};

TEST_F(RotatingRecordingTest, finishesAFileThatHasReachedItsSize) {
  limits.fileBytes = 1;  // which every event reaches
  limits.filesKept = 3;
  const auto recording = create();
  ASSERT_TRUE(recording) << error;
  for (std::uint64_t i = 1; i <= 6; ++i) ASSERT_TRUE(recording->write(event(i), kStart));
  EXPECT_EQ(recording->events(), 6U);
  EXPECT_EQ(recording->filesFinished(), 5U);
  ASSERT_TRUE(recording->close());
  EXPECT_EQ(timesOf(""), (std::vector<std::uint64_t>{6}));
  EXPECT_EQ(timesOf(".1"), (std::vector<std::uint64_t>{5}));
  EXPECT_EQ(timesOf(".2"), (std::vector<std::uint64_t>{4}));
  EXPECT_EQ(timesOf(".3"), (std::vector<std::uint64_t>{3}));
  EXPECT_FALSE(exists(".4"));
}

TEST_F(RotatingRecordingTest, countsTheBytesOfAllFiles) {
  limits.fileBytes = 200;
  limits.filesKept = 100;
  const auto recording = create();
  for (std::uint64_t i = 1; i <= 50; ++i) ASSERT_TRUE(recording->write(event(i), kStart));
  std::uint64_t bytes = 0;
  for (const auto& file : fs::directory_iterator(directory)) {
    bytes += file.file_size();
    EXPECT_LT(file.file_size(), 300U);
  }
  EXPECT_EQ(recording->bytes(), bytes);
  EXPECT_GT(recording->filesFinished(), 5U);
}

TEST_F(RotatingRecordingTest, finishesAFileThatIsOldEnough) {
  limits.fileAge = 60s;
  const auto recording = create();
  ASSERT_TRUE(recording->write(event(1), kStart));
  ASSERT_TRUE(recording->tend(kStart + 59s));
  EXPECT_FALSE(exists(".1"));
  ASSERT_TRUE(recording->tend(kStart + 60s));
  EXPECT_EQ(timesOf(".1"), (std::vector<std::uint64_t>{1}));
  EXPECT_TRUE(exists(""));
  // A file without events is not finished, however old; it is as old as its first event.
  ASSERT_TRUE(recording->tend(kStart + 600s));
  EXPECT_FALSE(exists(".2"));
  ASSERT_TRUE(recording->write(event(2), kStart + 600s));
  ASSERT_TRUE(recording->tend(kStart + 659s));
  EXPECT_FALSE(exists(".2"));
}

TEST_F(RotatingRecordingTest, writesWholeCompressedFiles) {
  path += ".gz";
  limits.fileBytes = 1;
  const auto recording = create();
  for (std::uint64_t i = 1; i <= 3; ++i) ASSERT_TRUE(recording->write(event(i), kStart));
  ASSERT_TRUE(recording->close());
  EXPECT_EQ(timesOf(".2"), (std::vector<std::uint64_t>{1}));
  EXPECT_EQ(timesOf(".1"), (std::vector<std::uint64_t>{2}));
  EXPECT_EQ(timesOf(""), (std::vector<std::uint64_t>{3}));
}

TEST_F(RotatingRecordingTest, overwritesNothingUnlessItMay) {
  put("");
  EXPECT_FALSE(create());
  EXPECT_EQ(error, path + ": File exists");
  EXPECT_TRUE(create(Existing::replaced));
  EXPECT_EQ(fs::file_size(path), 0U);
}

TEST_F(RotatingRecordingTest, refusesWhenAFinishedFileWouldComeToAnEnd) {
  put(".2");
  EXPECT_TRUE(create()) << error;  // it does not rotate
  fs::remove(path);
  limits.fileBytes = 100;
  EXPECT_FALSE(create());
  EXPECT_EQ(error, path + ".2: File exists");
  EXPECT_FALSE(exists(""));
  limits.filesKept = 1;
  EXPECT_TRUE(create());
}

TEST_F(RotatingRecordingTest, doesNotBeginOnAFullDisk) {
  limits.freeBytes = std::uint64_t{1} << 60U;
  EXPECT_FALSE(create());
  EXPECT_NE(error.find(" MB must stay free"), std::string::npos) << error;
  EXPECT_FALSE(exists(""));
}

TEST_F(RotatingRecordingTest, asksForNoSpaceWhereNoneIsTaken) {
  limits.freeBytes = std::uint64_t{1} << 60U;
  path = "/dev/null";
  const auto recording = create(Existing::replaced);
  ASSERT_TRUE(recording) << error;
  EXPECT_TRUE(recording->tend(kStart));
}

TEST_F(RotatingRecordingTest, rotatesRegularFilesOnly) {
  path = "/dev/null";
  EXPECT_TRUE(create(Existing::replaced)) << error;
  limits.fileBytes = 1;
  EXPECT_FALSE(create(Existing::replaced));
  EXPECT_EQ(error, "/dev/null: not a regular file");
}

TEST_F(RotatingRecordingTest, stopsWhenItCannotGoOnAfterAFile) {
  limits.fileBytes = 1;
  const auto recording = create();
  ASSERT_TRUE(recording->write(event(1), kStart));
  fs::remove(path);
  EXPECT_FALSE(recording->write(event(2), kStart));
  EXPECT_EQ(recording->error(), path + ".1: No such file or directory");
  EXPECT_FALSE(recording->tend(kStart));
}

TEST_F(RotatingRecordingTest, reportsADiskThatIsFull) {
  path = "/dev/full";
  const auto recording = create(Existing::replaced);
  ASSERT_TRUE(recording) << error;
  EXPECT_FALSE(recording->write(event(1), kStart));
  EXPECT_EQ(recording->error(), "/dev/full: No space left on device");
  EXPECT_EQ(recording->errorNumber(), ENOSPC);
  EXPECT_FALSE(recording->write(event(2), kStart));
  EXPECT_FALSE(recording->close());
}

TEST_F(RotatingRecordingTest, isReadableByItsOwnerOnly) {
  ASSERT_TRUE(create());
  EXPECT_EQ(fs::status(path).permissions() & fs::perms::all,
            fs::perms::owner_read | fs::perms::owner_write);
}

TEST(RotatingRecordingOnADescriptor, leavesItOpen) {
  int ends[2];
  ASSERT_EQ(::pipe(ends), 0);
  const auto recording = RotatingRecording::onDescriptor(ends[1], "a pipe");
  ASSERT_TRUE(recording->write(event(1), kStart));
  EXPECT_TRUE(recording->tend(kStart + 1h));
  EXPECT_TRUE(recording->close());
  EXPECT_EQ(::write(ends[1], "", 1), 1);
  ::close(ends[0]);
  ::close(ends[1]);
}

}  // namespace
}  // namespace qel
