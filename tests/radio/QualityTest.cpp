#include "radio/Quality.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

TEST(QualityScales, goDownFromGoodToFairWithinTheirAxis) {
  for (const Scale each :
       {Scale::rsrp, Scale::rsrq, Scale::sinr, Scale::rscp, Scale::ecno, Scale::rxlev}) {
    const QualityScale& scale = scaleOf(each);
    EXPECT_GT(scale.highest, scale.good) << scale.name;
    EXPECT_GT(scale.good, scale.fair) << scale.name;
    EXPECT_GT(scale.fair, scale.lowest) << scale.name;
  }
}

TEST(QualityScales, ofLevelsAreInDbmAndOfRatiosInDb) {
  for (const Scale level : {Scale::rsrp, Scale::rscp, Scale::rxlev}) {
    EXPECT_EQ(scaleOf(level).unit, "dBm");
  }
  for (const Scale ratio : {Scale::rsrq, Scale::sinr, Scale::ecno}) {
    EXPECT_EQ(scaleOf(ratio).unit, "dB");
  }
}

TEST(QualityScales, ofRsrpBeginAtMinus95AndMinus105Dbm) {
  EXPECT_EQ(scaleOf(Scale::rsrp).good, -95);
  EXPECT_EQ(scaleOf(Scale::rsrp).fair, -105);
}

}  // namespace
}  // namespace qel
