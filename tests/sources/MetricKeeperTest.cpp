#include "sources/MetricKeeper.h"

#include <gtest/gtest.h>

namespace qel::sources {
namespace {

using namespace std::chrono_literals;

constexpr std::uint32_t kCalm = 1;
constexpr std::uint32_t kLively = 2;

class MetricKeeperTest : public ::testing::Test {
 protected:
  MetricKeeperTest() : keeper({{kCalm, 0}, {kLively, 2}}, 5s) {}

  // How many were sent.
  int update() {
    int sent = 0;
    keeper.update(
        [this](std::uint32_t metric, std::uint64_t) -> std::optional<Bytes> {
          if (!there) return std::nullopt;
          return Bytes{metric == kCalm ? calm : lively};
        },
        7, now, [&sent](const SourceEvent&) { ++sent; });
    return sent;
  }

  MetricKeeper keeper;
  MetricKeeper::Clock::time_point now{1h};
  bool there = true;
  std::uint8_t calm = 0;
  std::uint8_t lively = 0;
};

TEST_F(MetricKeeperTest, SendsAValueOnceUntilItChanges) {
  EXPECT_EQ(update(), 2);
  EXPECT_EQ(update(), 0);
  calm = 1;
  EXPECT_EQ(update(), 1);
}

TEST_F(MetricKeeperTest, SendsAValueAgainAfterThePeriod) {
  update();
  now += 4999ms;
  EXPECT_EQ(update(), 0);
  EXPECT_EQ(keeper.due(), now + 1ms);
  now += 1ms;
  EXPECT_EQ(update(), 2);
}

TEST_F(MetricKeeperTest, SendsNoMoreInASecondThanItMay) {
  int sent = 0;
  for (int i = 0; i < 1000; ++i) {
    ++calm;
    ++lively;
    sent += update();
    now += 10ms;
  }
  EXPECT_EQ(sent, 1000 + 2 * 10);
}

TEST_F(MetricKeeperTest, SendsTheLastValueOnceItMay) {
  for (int i = 0; i < 3; ++i) {
    ++lively;
    update();
  }
  const auto until = keeper.waitingUntil();
  EXPECT_EQ(until, now + 1s);
  now = until;
  EXPECT_EQ(update(), 1);
  EXPECT_EQ(keeper.query(kLively).timeMs, 7U);
  EXPECT_EQ(keeper.waitingUntil(), MetricKeeper::Clock::time_point::max());
}

TEST_F(MetricKeeperTest, KnowsNoValueThatHasGone) {
  update();
  EXPECT_TRUE(keeper.query(kCalm).known);
  there = false;
  update();
  EXPECT_FALSE(keeper.query(kCalm).known);
  there = true;
  update();
  keeper.clear();
  EXPECT_FALSE(keeper.query(kCalm).known);
  EXPECT_EQ(update(), 2);
}

TEST_F(MetricKeeperTest, SendsAllWhenAsked) {
  update();
  keeper.sendAll();
  EXPECT_EQ(update(), 2);
}

}  // namespace
}  // namespace qel::sources
