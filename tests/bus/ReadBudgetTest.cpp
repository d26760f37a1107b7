#include "service/bus/ReadBudget.h"

#include <gtest/gtest.h>

namespace qel::service {
namespace {

TEST(ReadBudgetTest, AllowsAllWhileTheyTakeLittle) {
  ReadBudget budget;
  for (int i = 0; i < 1000; ++i) EXPECT_TRUE(budget.allows("a"));
}

// Reading all properties over and over kept everybody else waiting.
TEST(ReadBudgetTest, AllowsEveryCallerAFewWhenTheyTakeLong) {
  ReadBudget budget;
  budget.spend(ReadBudget::kOfAll);
  for (int i = 0; i < ReadBudget::kOfOneCaller; ++i) EXPECT_TRUE(budget.allows("a"));
  EXPECT_FALSE(budget.allows("a"));
  EXPECT_TRUE(budget.allows("b"));
}

TEST(ReadBudgetTest, BeginsAnewWithEveryTurn) {
  ReadBudget budget;
  budget.spend(ReadBudget::kOfAll);
  for (int i = 0; i < 10; ++i) budget.allows("a");
  budget.nextTurn();
  EXPECT_TRUE(budget.allows("a"));
}

}  // namespace
}  // namespace qel::service
