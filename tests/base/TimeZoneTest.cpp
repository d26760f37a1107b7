#include "base/TimeZone.h"

#include <gtest/gtest.h>

#include <cstdlib>

#include "support/FixedTimeZone.h"

namespace qel {
namespace {

using testing::FixedTimeZone;

const FixedTimeZone kUtc(0, "UTC");

TEST(DateText, showsDateTimeAndZone) {
  EXPECT_EQ(dateText(1500000000000.0, kUtc), "2017-07-14 02:40:00 UTC");
  EXPECT_EQ(dateText(1500000000000.0, FixedTimeZone(7200, "CEST")), "2017-07-14 04:40:00 CEST");
}

TEST(DateText, startsIn1970) { EXPECT_EQ(dateText(0.0, kUtc), "1970-01-01 00:00:00 UTC"); }

TEST(DateText, cutsOffPartsOfASecond) {
  EXPECT_EQ(dateText(1999.0, kUtc), "1970-01-01 00:00:01 UTC");
  EXPECT_EQ(dateText(-1.0, kUtc), "1969-12-31 23:59:59 UTC");
}

TEST(DateText, rendersTheLargestTimestampThereIs) {
  const double largest = 18446744073709551615.0;
  EXPECT_EQ(dateText(largest, kUtc).substr(0, 9), "584556019");
  EXPECT_EQ(dateText(largest, systemTimeZone()).substr(0, 9), "584556019");
}

TEST(SystemTimeZone, followsAChangeOfTheZone) {
  ::setenv("TZ", "UTC0", 1);
  EXPECT_EQ(dateText(0.0, systemTimeZone()), "1970-01-01 00:00:00 UTC");
  ::setenv("TZ", "XYZ-5:30", 1);
  EXPECT_EQ(dateText(0.0, systemTimeZone()), "1970-01-01 05:30:00 XYZ");
  ::unsetenv("TZ");
}

TEST(SystemTimeZone, knowsDaylightSaving) {
  ::setenv("TZ", "CET-1CEST,M3.5.0,M10.5.0/3", 1);
  EXPECT_EQ(dateText(1500000000000.0, systemTimeZone()), "2017-07-14 04:40:00 CEST");
  EXPECT_EQ(dateText(1484000000000.0, systemTimeZone()), "2017-01-09 23:13:20 CET");
  ::unsetenv("TZ");
}

}  // namespace
}  // namespace qel
