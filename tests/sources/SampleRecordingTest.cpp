// The recording that is kept beside the tests is the simulated drive as it is now.
//
// After a change of the drive, make it anew: ninja update-sample-recording
#include <gtest/gtest.h>

#include <sys/stat.h>

#include "recording/EventLine.h"
#include "recording/RecordingReader.h"
#include "sources/support/SampleDrive.h"

namespace qel {
namespace {

constexpr const char* kFile = QEL_TEST_DATA_DIR "/simulated_drive.jsonl.gz";

TEST(SampleRecording, IsTheDriveEventByEvent) {
  RecordingFault fault;
  const auto reader = RecordingReader::open(kFile, RecordingReader::BadLines::fail, fault);
  ASSERT_TRUE(reader) << fault.message;
  const auto events = testing::sampleDrive();
  for (const RecordedEvent& event : events) {
    const auto kept = reader->next();
    ASSERT_TRUE(kept) << "shorter than the drive";
    ASSERT_EQ(eventLine(*kept), eventLine(event));
  }
  EXPECT_FALSE(reader->next()) << "longer than the drive";
  EXPECT_FALSE(reader->fault());
  EXPECT_FALSE(reader->cutOff());
  EXPECT_GT(events.size(), 4000U);
}

TEST(SampleRecording, IsSmall) {
  struct stat status {};
  ASSERT_EQ(::stat(kFile, &status), 0);
  EXPECT_LT(status.st_size, 300'000);
}

}  // namespace
}  // namespace qel
