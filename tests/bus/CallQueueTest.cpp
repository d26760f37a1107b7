#include "service/bus/CallQueue.h"

#include <gtest/gtest.h>

#include <vector>

namespace qel::service {
namespace {

using Names = std::vector<std::string>;

class CallQueueTest : public ::testing::Test {
 protected:
  void add(const std::string& caller, const std::string& call) {
    queue.add(caller, {[this, call] { answered.push_back(call); },
                       [this, call] { refused.push_back(call); }});
  }
  void addMany(const std::string& caller, std::size_t count) {
    for (std::size_t i = 0; i < count; ++i) add(caller, caller + std::to_string(i));
  }

  CallQueue queue;
  Names answered;
  Names refused;
};

TEST_F(CallQueueTest, AnswersTheCallsOfOneCallerInTheirOrder) {
  addMany("a", 3);
  EXPECT_EQ(queue.size(), 3U);
  while (!queue.empty()) queue.answerNext();
  EXPECT_EQ(answered, (Names{"a0", "a1", "a2"}));
}

// A caller that sent many calls was answered to the last before anybody else was.
TEST_F(CallQueueTest, AnswersCallersInTurn) {
  addMany("a", 4);
  addMany("b", 1);
  addMany("c", 2);
  while (!queue.empty()) queue.answerNext();
  EXPECT_EQ(answered, (Names{"a0", "b0", "c0", "a1", "c1", "a2", "a3"}));
}

TEST_F(CallQueueTest, RefusesWhatACallerSendsBeyondItsShare) {
  addMany("a", CallQueue::kMostOfOneCaller + 2);
  EXPECT_EQ(refused, (Names{"a32", "a33"}));
  EXPECT_TRUE(queue.isFullFor("a"));
  EXPECT_FALSE(queue.isFullFor("b"));
  queue.answerNext();
  EXPECT_FALSE(queue.isFullFor("a"));
}

TEST_F(CallQueueTest, TakesTheNewestOfWhoeverHasMostWhenAllShareTooMany) {
  for (int i = 0; i < 8; ++i) addMany("full" + std::to_string(i), CallQueue::kMostOfOneCaller);
  ASSERT_EQ(queue.size(), CallQueue::kMost);
  add("late", "late");
  EXPECT_EQ(queue.size(), CallQueue::kMost);
  EXPECT_EQ(refused, (Names{"full031"}));
  for (int i = 0; i < 9; ++i) queue.answerNext();
  EXPECT_EQ(answered.back(), "late");
}

TEST_F(CallQueueTest, NeitherAnswersNorRefusesACallerThatHasGone) {
  addMany("a", 3);
  addMany("b", 1);
  queue.forget("a");
  queue.forget("nobody");
  EXPECT_EQ(queue.size(), 1U);
  while (!queue.empty()) queue.answerNext();
  EXPECT_EQ(answered, (Names{"b0"}));
  EXPECT_TRUE(refused.empty());
}

TEST_F(CallQueueTest, ACallMayForgetItsOwnCaller) {
  queue.add("a", {[this] { queue.forget("a"); }, [] {}});
  addMany("a", 1);
  queue.answerNext();
  EXPECT_TRUE(queue.empty());
}

}  // namespace
}  // namespace qel::service
