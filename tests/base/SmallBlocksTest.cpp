#include "base/SmallBlocks.h"

#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <set>
#include <thread>
#include <vector>

#include "base/DispatchQueue.h"
#include "support/Sanitized.h"

namespace qel {
namespace {

constexpr std::size_t kSize = 200;

// On a thread of its own, which then ends.
void elsewhere(const std::function<void()>& work) { std::thread(work).join(); }

TEST(SmallBlocks, areHandedOutAgainOnTheThreadThatGaveThemBack) {
  if (testing::kIsSanitized) GTEST_SKIP() << "every block is the heap's";
  void* first = SmallBlocks::take(kSize);
  SmallBlocks::give(first, kSize);
  void* again = SmallBlocks::take(kSize - 1);  // of the same step
  EXPECT_EQ(again, first);
  SmallBlocks::give(again, kSize - 1);
}

// One thread only took, the other only gave back, and every block came from the heap and went
// there.
TEST(SmallBlocks, goRoundBetweenAThreadThatTakesAndOneThatGivesBack) {
  constexpr int kRounds = 200;
  constexpr std::size_t kBlocksOfARound = 50;
  std::set<void*> seen;
  std::vector<void*> blocks;
  MainQueue main;
  SerialQueue giver("giver");
  SerialQueue taker("taker");
  for (int round = 0; round < kRounds; ++round) {
    bool done = false;
    taker.async([&] {
      for (std::size_t i = 0; i < kBlocksOfARound; ++i) blocks.push_back(SmallBlocks::take(kSize));
      giver.async([&] {
        for (void* block : blocks) SmallBlocks::give(block, kSize);
        main.async([&] { done = true; });
      });
    });
    ASSERT_TRUE(main.runUntil([&] { return done; }, std::chrono::seconds(10)));
    seen.insert(blocks.begin(), blocks.end());
    blocks.clear();
  }
  if (testing::kIsSanitized) GTEST_SKIP() << "where they come from";
  EXPECT_LT(seen.size(), 500U) << "of " << kRounds * kBlocksOfARound;
}

TEST(SmallBlocks, mayBeGivenBackOnAThreadThatNeverTookOne) {
  std::vector<void*> blocks;
  for (int i = 0; i < 1000; ++i) blocks.push_back(SmallBlocks::take(kSize));
  elsewhere([&] {
    for (void* block : blocks) SmallBlocks::give(block, kSize);
  });
}

TEST(SmallBlocks, thatAreLargeComeFromTheHeap) {
  elsewhere([] {
    SmallBlocks::give(SmallBlocks::take(SmallBlocks::kLargest), SmallBlocks::kLargest);
    SmallBlocks::give(SmallBlocks::take(SmallBlocks::kLargest + 1), SmallBlocks::kLargest + 1);
  });
}

}  // namespace
}  // namespace qel
