#include "base/Sequence.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <thread>
#include <vector>

namespace qel {
namespace {

using Numbers = Sequence<int>;
using Texts = Sequence<std::string>;

TEST(Sequence, growsAndKeepsItsElements) {
  Texts texts;
  for (int i = 0; i < 1000; ++i) texts.push_back(std::to_string(i) + " is not so short a text");
  ASSERT_EQ(texts.size(), 1000U);
  for (int i = 0; i < 1000; ++i) {
    EXPECT_EQ(texts[static_cast<std::size_t>(i)], std::to_string(i) + " is not so short a text");
  }
}

TEST(Sequence, takesAnElementOfItsOwnWhenItGrows) {
  Texts texts = {"a text that is too long for the place in the string"};
  for (int i = 0; i < 100; ++i) texts.push_back(texts[0]);
  EXPECT_EQ(texts.back(), texts.front());
}

TEST(Sequence, copiesAndMoves) {
  const Texts original = {"one", "two"};
  Texts copy = original;
  copy.push_back("three");
  EXPECT_EQ(original, (Texts{"one", "two"}));
  const Texts moved = std::move(copy);
  EXPECT_EQ(moved, (Texts{"one", "two", "three"}));
  copy = original;
  EXPECT_EQ(copy, original);
  EXPECT_EQ(Numbers(), Numbers{});
  EXPECT_NE((Numbers{1}), (Numbers{1, 2}));
}

TEST(Sequence, erasesAndClears) {
  Texts texts = {"a", "b", "c"};
  texts.erase(texts.begin() + 1);
  EXPECT_EQ(texts, (Texts{"a", "c"}));
  texts.erase(texts.end() - 1);
  EXPECT_EQ(texts, (Texts{"a"}));
  texts.clear();
  EXPECT_TRUE(texts.empty());
  EXPECT_THROW(static_cast<void>(texts.at(0)), std::out_of_range);
}

TEST(Sequence, givesEveryElementItsEnd) {
  const auto counted = std::make_shared<int>(1);
  {
    Sequence<std::shared_ptr<int>> several(20, counted);
    EXPECT_EQ(counted.use_count(), 21);
    several.erase(several.begin());
    EXPECT_EQ(counted.use_count(), 20);
  }
  EXPECT_EQ(counted.use_count(), 1);
}

TEST(Sequence, fillsBehindWhatThereIs) {
  Numbers numbers = {1};
  {
    Numbers::Filling filling(numbers, 50);
    for (int i = 2; i < 40; ++i) filling.append(i);
  }
  ASSERT_EQ(numbers.size(), 39U);
  EXPECT_EQ(numbers.front(), 1);
  EXPECT_EQ(numbers.back(), 39);
}

// Elements that tell what they own, and count how many own something.
struct Part {
  explicit Part(int number, bool owning = false) : value(number), owns(owning) { owners += owns; }
  Part(const Part& other) : Part(other.value, other.owns) {}
  Part& operator=(const Part&) = delete;
  ~Part() { owners -= owns; }
  bool ownsNothing() const { return !owns; }
  friend bool operator==(const Part& a, const Part& b) { return a.value == b.value; }

  inline static int owners = 0;
  int value;
  bool owns;
};
using Parts = Sequence<Part>;

TEST(Sequence, endsWhatOwnsSomethingAmongWhatDoesNot) {
  {
    Parts parts;
    for (int i = 0; i < 100; ++i) parts.emplace_back(i, i % 10 == 9);
    EXPECT_EQ(Part::owners, 10);
    const Parts copy = parts;
    EXPECT_EQ(copy, parts);
    EXPECT_EQ(Part::owners, 20);
    parts.clear();
    EXPECT_EQ(Part::owners, 10);
    parts.emplace_back(1);
    const Parts plain = parts;
    EXPECT_EQ(plain, parts);
    Parts::Filling(parts, 2).append(2, true);
    EXPECT_EQ(Part::owners, 11);
  }
  EXPECT_EQ(Part::owners, 0);
}

TEST(Sequence, endsWhatOwnsSomethingOnlySinceItWasChanged) {
  {
    Parts parts;
    for (int i = 0; i < 3; ++i) parts.emplace_back(i);
    for (Part& part : parts) {
      part.owns = true;
      ++Part::owners;
    }
    const Parts copy = parts;
    EXPECT_EQ(Part::owners, 6);
  }
  EXPECT_EQ(Part::owners, 0);
}

TEST(Sequence, endsWhatCameToOwnSomethingInItsPlace) {
  {
    Parts parts;
    parts.emplace_back(0);
    parts.emplace_back(5);
    {
      Parts::Spread spread(parts, 8, 0b100001);
      spread.make(2, 2);
      spread.make(7, 7, true);
      spread.make(7, 8, true);
      spread[2].owns = true;
      ++Part::owners;
      EXPECT_EQ(Part::owners, 2) << "the one before it in its place has ended";
    }
    EXPECT_EQ(parts, (Parts{Part(0), Part(2), Part(5), Part(8)}));
    const Parts copy = parts;
    EXPECT_EQ(Part::owners, 4);
  }
  EXPECT_EQ(Part::owners, 0);
}

// Blocks may be taken on one thread and given back on another, also while threads come and go.
TEST(SmallBlocks, mayChangeThreads) {
  for (int round = 0; round < 4; ++round) {
    std::vector<Texts> handedOver;
    std::thread([&handedOver] {
      for (std::size_t size = 1; size < 300; ++size) {
        handedOver.emplace_back(size % 80, std::string(size, 'x'));
      }
    }).join();
    std::thread([taken = std::move(handedOver)]() mutable { taken.clear(); }).join();
  }
}

TEST(SmallBlocks, haveTheSizeThatWasAskedFor) {
  std::vector<std::pair<unsigned char*, std::size_t>> blocks;
  for (int round = 0; round < 3; ++round) {
    for (std::size_t size = 1; size < 3000; size += 7) {
      auto* block = static_cast<unsigned char*>(SmallBlocks::take(size));
      std::fill_n(block, size, static_cast<unsigned char>(size));
      blocks.emplace_back(block, size);
    }
    for (const auto& [block, size] : blocks) {
      EXPECT_EQ(std::count(block, block + size, static_cast<unsigned char>(size)),
                static_cast<std::ptrdiff_t>(size));
      SmallBlocks::give(block, size);
    }
    blocks.clear();
  }
}

}  // namespace
}  // namespace qel
