#include "base/TimeZone.h"

#include <gtest/gtest.h>

#include <chrono>
#include <cstdlib>
#include <thread>

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

// A zone whose rules a test changes.
class ChangingZone final : public TimeZone {
 public:
  CivilTime at(std::int64_t seconds) const override {
    const bool summer = seconds >= changesAt;
    CivilTime time =
        FixedTimeZone(summer ? 7200 + odd : 3600 + odd, summer ? "CEST" : "CET").at(seconds);
    if (moved) time.zone = "XYZ";
    return time;
  }
  std::uint64_t version() const override { return moved ? 1 : 0; }

  std::int64_t changesAt = 1490490000;  // 2017-03-26 01:00 UTC
  std::int64_t odd = 0;
  bool moved = false;
};

void expectSameTexts(DateTexts& dates, const TimeZone& zone, double from, double to, double step) {
  for (double time = from; time < to; time += step) {
    ASSERT_EQ(dates.at(time), dateText(time, zone)) << time;
  }
}

TEST(DateTexts, sayWhatASingleTextSays) {
  DateTexts dates(kUtc);
  expectSameTexts(dates, kUtc, 1500000000000.0, 1500010000000.0, 7123.25);
  expectSameTexts(dates, kUtc, -10000000.0, 10000000.0, 33331.5);
  expectSameTexts(dates, kUtc, 18446744073709551615.0, 18446744073709551616.0, 1e15);
  expectSameTexts(dates, kUtc, 0x1p50 - 5000000.0, 0x1p50 + 5000000.0, 1999.0);
}

TEST(DateTexts, mayGoBackAndForth) {
  DateTexts dates(kUtc);
  for (const double time : {0.0, 1500000000000.0, 999.0, 1499999999999.0, 1500000899999.0}) {
    EXPECT_EQ(dates.at(time), dateText(time, kUtc));
  }
}

TEST(DateTexts, changeWithDaylightSaving) {
  ChangingZone zone;
  DateTexts dates(zone);
  expectSameTexts(dates, zone, 1490486000000.0, 1490494000000.0, 1000.0);
  zone.changesAt = 1490490123;  // in the middle of a quarter
  expectSameTexts(dates, zone, 1490486000000.0, 1490494000000.0, 1000.0);
}

TEST(DateTexts, changeInZonesOfOddSeconds) {
  ChangingZone zone;
  zone.odd = 1172;
  DateTexts dates(zone);
  expectSameTexts(dates, zone, 1490486000000.0, 1490494000000.0, 1000.0);
}

TEST(DateTexts, changeWithTheRules) {
  ChangingZone zone;
  DateTexts dates(zone);
  EXPECT_EQ(dates.at(1500000000000.0), "2017-07-14 04:40:00 CEST");
  zone.moved = true;
  EXPECT_EQ(dates.at(1500000001000.0), "2017-07-14 04:40:01 XYZ");
}

TEST(DateTexts, noticeAChangeOfTheSystemsZone) {
  ::setenv("TZ", "UTC0", 1);
  DateTexts dates(systemTimeZone());
  EXPECT_EQ(dates.at(0.0), "1970-01-01 00:00:00 UTC");
  ::setenv("TZ", "XYZ-5:30", 1);
  const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(30);
  while (dates.at(0.0) != "1970-01-01 05:30:00 XYZ") {
    ASSERT_LT(std::chrono::steady_clock::now(), deadline) << dates.at(0.0);
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
  }
  ::unsetenv("TZ");
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
