#include "sources/diagnostics/session/ModemClock.h"

#include <gtest/gtest.h>

namespace qel::diagnostics {
namespace {

constexpr std::uint64_t kHostMs = 1'790'000'000'000;
constexpr std::uint64_t kDeviceMs = 315'964'807'000;  // 1980: no network has told the time yet

TEST(ModemClock, GivesThePacketTheTimeOfTheHost) {
  ModemClock clock;
  EXPECT_EQ(clock.hostMs(kDeviceMs, kHostMs), kHostMs);
}

TEST(ModemClock, GoesByTheQuickestPacketOfTheLastMinute) {
  ModemClock clock;
  EXPECT_EQ(clock.hostMs(kDeviceMs, kHostMs), kHostMs);
  EXPECT_EQ(clock.hostMs(kDeviceMs + 1000, kHostMs + 1300), kHostMs + 1000);  // 300 ms late
  EXPECT_EQ(clock.hostMs(kDeviceMs + 2000, kHostMs + 1900), kHostMs + 1900);  // quicker
  EXPECT_EQ(clock.hostMs(kDeviceMs + 3000, kHostMs + 3500), kHostMs + 2900);
}

TEST(ModemClock, IsNeverLaterThanTheHost) {
  ModemClock clock;
  for (unsigned i = 0; i < 1000; ++i) {
    const std::uint64_t host = kHostMs + 137 * i;
    EXPECT_LE(clock.hostMs(kDeviceMs + 137 * i - 13 * (i % 7), host), host);
  }
}

TEST(ModemClock, ForgetsAQuickPacketAfterAMinute) {
  ModemClock clock;
  clock.hostMs(kDeviceMs, kHostMs);
  for (unsigned s = 1; s <= 70; ++s) {
    clock.hostMs(kDeviceMs + 1000 * s, kHostMs + 1000 * s + 40);
  }
  EXPECT_EQ(clock.hostMs(kDeviceMs + 71'000, kHostMs + 71'040), kHostMs + 71'040);
}

TEST(ModemClock, BeginsAnewWhenTheNetworkTellsTheTime) {
  ModemClock clock;
  clock.hostMs(kDeviceMs, kHostMs);
  EXPECT_EQ(clock.hostMs(kHostMs + 18'000, kHostMs + 100), kHostMs + 100);  // now GPS time
  EXPECT_EQ(clock.hostMs(kHostMs + 19'000, kHostMs + 1200), kHostMs + 1100);
}

TEST(ModemClock, BeginsAnewWhenTheModemDoes) {
  ModemClock clock;
  clock.hostMs(kHostMs, kHostMs);
  EXPECT_EQ(clock.hostMs(kDeviceMs, kHostMs + 500), kHostMs + 500);
}

TEST(ModemClock, TakesALateBatchForLate) {
  ModemClock clock;
  clock.hostMs(kDeviceMs, kHostMs);
  EXPECT_EQ(clock.hostMs(kDeviceMs + 1000, kHostMs + 30'000), kHostMs + 1000);
}

TEST(ModemClock, FollowsTheHostWhenItIsSetBack) {
  ModemClock clock;
  clock.hostMs(kDeviceMs, kHostMs);
  EXPECT_EQ(clock.hostMs(kDeviceMs + 1000, kHostMs - 60'000), kHostMs - 60'000);
}

TEST(ModemClock, ComparesAnewWhenAsked) {
  ModemClock clock;
  clock.hostMs(kDeviceMs, kHostMs);
  clock.beginAnew();
  EXPECT_EQ(clock.hostMs(kDeviceMs + 1000, kHostMs + 4000), kHostMs + 4000);
}

TEST(ModemClock, HoldsEveryStamp) {
  ModemClock clock;
  EXPECT_EQ(clock.hostMs(352'159'685'688'320, kHostMs), kHostMs);
  EXPECT_EQ(clock.hostMs(0, kHostMs), kHostMs);
}

}  // namespace
}  // namespace qel::diagnostics
