#include "fleet/Retries.h"

#include <gtest/gtest.h>

namespace qel::fleet {
namespace {

using namespace std::chrono_literals;

const Retries::Clock::time_point kNow{1h};

Retries::Clock::duration pauseAfter(int failures, Retries retries) {
  for (int i = 0; i < failures; ++i) retries.failed(kNow);
  return retries.next() - kNow;
}

TEST(Retries, comeAtOnceBeforeAnythingHasFailed) { EXPECT_LE(Retries().next(), kNow); }

TEST(Retries, waitTwiceAsLongEachTimeButForChance) {
  for (int failures = 1; failures < 9; ++failures) {
    const auto whole = std::chrono::seconds(1 << (failures - 1));
    const auto pause = pauseAfter(failures, Retries());
    EXPECT_GE(pause, whole / 2) << failures;
    EXPECT_LE(pause, whole) << failures;
  }
}

TEST(Retries, waitNoLongerThanTheirLongest) {
  EXPECT_LE(pauseAfter(100, Retries()), 5min);
  EXPECT_GE(pauseAfter(100, Retries()), 150s);
  EXPECT_LE(pauseAfter(100, Retries(5s)), 5s);
}

TEST(Retries, beginAnewOnceSomethingHasSucceeded) {
  Retries retries;
  for (int i = 0; i < 5; ++i) retries.failed(kNow);
  retries.succeeded();
  retries.failed(kNow);
  EXPECT_LE(retries.next() - kNow, 1s);
}

}  // namespace
}  // namespace qel::fleet
