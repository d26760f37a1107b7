#include "base/Work.h"

#include <gtest/gtest.h>

#include <memory>

namespace qel {
namespace {

TEST(Work, isDoneWhenItIsCalled) {
  int runs = 0;
  Work work = [&runs] { ++runs; };
  EXPECT_EQ(runs, 0);
  work();
  EXPECT_EQ(runs, 1);
}

TEST(Work, holdsWhatItNeedsUntilItIsGone) {
  const auto held = std::make_shared<int>(5);
  Work work = [held] {};
  EXPECT_EQ(held.use_count(), 2);
  Work moved = std::move(work);
  EXPECT_EQ(held.use_count(), 2);
  moved();
  EXPECT_EQ(held.use_count(), 2);
  moved = {};
  EXPECT_EQ(held.use_count(), 1);
}

TEST(Work, takesWhatCanOnlyBeMoved) {
  int seen = 0;
  Work work = [number = std::make_unique<int>(7), &seen] { seen = *number; };
  work();
  EXPECT_EQ(seen, 7);
}

TEST(Work, saysWhetherThereIsAnythingToDo) {
  EXPECT_FALSE(Work());
  EXPECT_TRUE(Work([] {}));
}

}  // namespace
}  // namespace qel
