#include "service/StateSaver.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <future>
#include <optional>

#include "service/support/FakeKeeper.h"

namespace qel::service {
namespace {

using testing::FakeKeeper;
using testing::HeldWaitClock;
using testing::KeptStates;

class StateSaverTest : public ::testing::Test {
 protected:
  void change() {
    ++number;
    saver->changed();
  }
  void changeAtLeisure() {
    ++number;
    saver->changed(StateSaver::When::withinASecond);
  }
  // The numbers of the states that were written.
  std::vector<std::int64_t> written() const {
    std::vector<std::int64_t> numbers;
    for (const KeptState& state : saved->all()) {
      numbers.push_back(state.configurations.begin()->first);
    }
    return numbers;
  }

  std::atomic<std::int64_t> number = 0;
  HeldWaitClock clock;
  std::shared_ptr<KeptStates> saved = std::make_shared<KeptStates>();
  std::optional<StateSaver> saver{std::in_place, std::make_unique<FakeKeeper>(saved),
                                  [this] {
                                    return KeptState{{{number, Bytes{}}}, {}};
                                  },
                                  clock};
};

TEST_F(StateSaverTest, WritesNothingWithoutAChange) {
  saver.reset();
  EXPECT_TRUE(saved->all().empty());
}

TEST_F(StateSaverTest, WritesTheFirstChangeAtOnce) {
  change();
  ASSERT_TRUE(saved->waitFor(1));
  EXPECT_EQ(written(), (std::vector<std::int64_t>{1}));
}

// Two configurations in turn made the service write and synchronise two thousand times a second.
TEST_F(StateSaverTest, WritesManyChangesWithinASecondTogether) {
  change();
  ASSERT_TRUE(saved->waitFor(1));
  ASSERT_TRUE(clock.waitForWaits(1));
  for (int i = 0; i < 1000; ++i) change();
  clock.advance(StateSaver::kPauseMs - 1);
  EXPECT_EQ(written(), (std::vector<std::int64_t>{1}));
  clock.advance(1);
  ASSERT_TRUE(saved->waitFor(2));
  EXPECT_EQ(written(), (std::vector<std::int64_t>{1, 1001}));
}

TEST_F(StateSaverTest, WritesWhatIsLeftAtTheEndWithoutWaiting) {
  change();
  ASSERT_TRUE(clock.waitForWaits(1));
  change();
  change();
  saver.reset();
  EXPECT_EQ(written(), (std::vector<std::int64_t>{1, 3}));
}

TEST_F(StateSaverTest, WritesAtOnceAgainAfterAQuietSecond) {
  change();
  ASSERT_TRUE(clock.waitForWaits(1));
  clock.advance(StateSaver::kPauseMs);
  change();
  ASSERT_TRUE(saved->waitFor(2));
  EXPECT_EQ(written().back(), 2);
}

// Every change waited in vain while an earlier one was being written, and with it every caller.
TEST_F(StateSaverTest, ADiskThatDoesNotAnswerHoldsUpNoFloodOfChanges) {
  saved->hold(true);
  change();
  EXPECT_TRUE(saved->waitForBegun(1));
  const auto flood = std::async(std::launch::async, [this] {
    for (int i = 0; i < 10'000; ++i) change();
  });
  EXPECT_EQ(flood.wait_for(std::chrono::seconds(30)), std::future_status::ready);
  EXPECT_TRUE(written().empty()) << "the disk has not answered yet";
  saved->hold(false);
  flood.wait();
  saver.reset();
  EXPECT_EQ(written(), (std::vector<std::int64_t>{1, 10'001}));
}

TEST_F(StateSaverTest, WritesAChangeThatCanWaitWithinASecond) {
  changeAtLeisure();
  ASSERT_TRUE(clock.waitForWaits(1));
  EXPECT_TRUE(saved->all().empty());
  clock.advance(StateSaver::kPauseMs);
  ASSERT_TRUE(saved->waitFor(1));
}

// A viewer clears its configuration and installs it again at once.
TEST_F(StateSaverTest, WritesAChangeThatCanWaitWithTheNextThatCannot) {
  changeAtLeisure();
  ASSERT_TRUE(clock.waitForWaits(1));
  change();
  ASSERT_TRUE(saved->waitFor(1));
  EXPECT_EQ(written(), (std::vector<std::int64_t>{2}));
}

TEST_F(StateSaverTest, WritesAtTheEndWhatCouldWait) {
  changeAtLeisure();
  ASSERT_TRUE(clock.waitForWaits(1));
  saver.reset();
  EXPECT_EQ(written(), (std::vector<std::int64_t>{1}));
}

}  // namespace
}  // namespace qel::service
