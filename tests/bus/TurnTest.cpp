// A connection on which messages never end.

#include "bus/Turn.h"

#include <gtest/gtest.h>

namespace qel::testing {
namespace {

struct Messages {
  bool processPendingRequest() {
    if (left == 0) return false;
    --left;
    return true;
  }
  int left;
};

// A flood of messages kept the client from its end, its commands and its events.
TEST(TurnOfTheBus, EndsThoughMoreMessagesCome) {
  constexpr int kFlood = 1'000'000;
  Messages messages{kFlood};
  bus::processTurn(messages);
  EXPECT_EQ(messages.left, kFlood - bus::kMostMessagesOfATurn);
}

TEST(TurnOfTheBus, TakesAllOfAFew) {
  Messages messages{bus::kMostMessagesOfATurn};
  bus::processTurn(messages);
  EXPECT_EQ(messages.left, 0);
}

}  // namespace
}  // namespace qel::testing
