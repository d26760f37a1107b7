#include "history/recorded/RecordingDigest.h"

#include <gtest/gtest.h>

#include "support/RecordedLines.h"

namespace qel::testing {
namespace {

TEST(RecordingDigest, countsCellsAndTime) {
  const TemporaryFolder folder;
  const std::string path =
      folder.file("a.jsonl", lineOf(lteCell(5000, 1)) + lineOf(lteCell(6000, 2)) + "nonsense\n" +
                                 lineOf(lteCell(7000, 1)) + lineOf(lteCell(7500, 1)));
  RecordingFault fault;
  const auto digest = RecordingDigest::open(path, fault);
  ASSERT_TRUE(digest);
  EXPECT_TRUE(digest->readOn(2));
  EXPECT_FALSE(digest->readOn(100));
  EXPECT_EQ(digest->events(), 4U);
  EXPECT_EQ(digest->beginMs(), 5000U);
  EXPECT_EQ(digest->lengthMs(), 2500U);
  EXPECT_EQ(digest->cells(), 2U);
  EXPECT_EQ(digest->fault(), "");
}

TEST(RecordingDigest, countsACellOnceWhoseIdentityIsToldLater) {
  const TemporaryFolder folder;
  KCellularLteScellInfo bare;
  bare.setPhyCellId(1);
  bare.setDlFreq(1300);
  const auto withoutIdentity = metricEvent(5000, MetricValidator::K_LTE_SCELL_INFO, bare.data());
  bare.setPhyCellId(3);
  const auto never = metricEvent(8000, MetricValidator::K_LTE_SCELL_INFO, bare.data());
  const std::string path =
      folder.file("a.jsonl", lineOf(withoutIdentity) + lineOf(lteCell(6000, 1)) +
                                 lineOf(lteCell(7000, 2)) + lineOf(never));
  RecordingFault fault;
  const auto digest = RecordingDigest::open(path, fault);
  EXPECT_FALSE(digest->readOn(100));
  EXPECT_EQ(digest->cells(), 3U);
}

TEST(RecordingDigest, tellsWhyAFileIsNoRecording) {
  const TemporaryFolder folder;
  RecordingFault fault;
  EXPECT_FALSE(RecordingDigest::open(folder.path(), fault));
  EXPECT_NE(fault.message, "");
  const auto digest =
      RecordingDigest::open(folder.file("a.jsonl.gz", "\x1f\x8b damaged, as anybody sees"), fault);
  ASSERT_TRUE(digest);
  EXPECT_FALSE(digest->readOn(10));
  EXPECT_EQ(digest->events(), 0U);
  EXPECT_NE(digest->fault(), "");
}

}  // namespace
}  // namespace qel::testing
