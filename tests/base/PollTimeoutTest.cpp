#include "base/PollTimeout.h"

#include <gtest/gtest.h>

namespace qel::testing {
namespace {

using namespace std::chrono_literals;
using Steady = std::chrono::steady_clock;

TEST(PollTimeout, IsForEverWithoutAMoment) {
  EXPECT_EQ(pollTimeout(std::nullopt), -1);
  EXPECT_EQ(pollTimeout(Steady::time_point::max()), -1);
}

TEST(PollTimeout, IsNothingOnceTheMomentIsOver) {
  EXPECT_EQ(pollTimeout(Steady::now()), 0);
  EXPECT_EQ(pollTimeout(Steady::now() - 1h), 0);
}

TEST(PollTimeout, IsWhatIsLeftAndADayAtTheMost) {
  const auto moment = Steady::now() + 1h;
  const int left = pollTimeout(moment);
  EXPECT_LE(left, 3'600'000);
  EXPECT_GE(Steady::now() + std::chrono::milliseconds(left), moment) << "rounded up";
  EXPECT_EQ(pollTimeout(Steady::now() + 100 * 24h), 86'400'000);
}

TEST(PollTimeout, TheShorterOneIsNotForEver) {
  EXPECT_EQ(shorterTimeout(-1, -1), -1);
  EXPECT_EQ(shorterTimeout(-1, 7), 7);
  EXPECT_EQ(shorterTimeout(7, -1), 7);
  EXPECT_EQ(shorterTimeout(7, 0), 0);
  EXPECT_EQ(shorterTimeout(3, 7), 3);
}

}  // namespace
}  // namespace qel::testing
