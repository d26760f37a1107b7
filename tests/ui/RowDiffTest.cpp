#include "ui/kit/RowDiff.h"

#include <gtest/gtest.h>

#include <random>
#include <string>

namespace qel {
namespace {

using Kind = RowStep::Kind;

std::vector<RowStep> steps(const std::string& before, const std::string& after) {
  return rowSteps(before.size(), after.size(), [&before, &after](std::size_t i, std::size_t j) {
    return before[i] == after[j];
  });
}

std::string applied(std::string rows, const std::string& after, const std::vector<RowStep>& all) {
  for (const RowStep& step : all) {
    if (step.kind == Kind::remove) {
      rows.erase(step.first, step.count);
    } else {
      rows.insert(step.first, after, step.first, step.count);
    }
  }
  return rows;
}

std::size_t rowsTouched(const std::vector<RowStep>& all) {
  std::size_t rows = 0;
  for (const RowStep& step : all) rows += step.count;
  return rows;
}

TEST(RowDiff, ofEqualListsIsNothing) {
  EXPECT_TRUE(steps("", "").empty());
  EXPECT_TRUE(steps("abc", "abc").empty());
}

TEST(RowDiff, fillsAndEmptiesAList) {
  EXPECT_EQ(steps("", "abc"), (std::vector<RowStep>{{Kind::insert, 0, 3}}));
  EXPECT_EQ(steps("abc", ""), (std::vector<RowStep>{{Kind::remove, 0, 3}}));
}

TEST(RowDiff, touchesOnlyTheRowThatCameOrWent) {
  EXPECT_EQ(steps("acd", "abcd"), (std::vector<RowStep>{{Kind::insert, 1, 1}}));
  EXPECT_EQ(steps("abcd", "abd"), (std::vector<RowStep>{{Kind::remove, 2, 1}}));
}

TEST(RowDiff, removesFromTheBackThenInsertsFromTheFront) {
  EXPECT_EQ(
      steps("axbyc", "aubvc"),
      (std::vector<RowStep>{
          {Kind::remove, 3, 1}, {Kind::remove, 1, 1}, {Kind::insert, 1, 1}, {Kind::insert, 3, 1}}));
}

TEST(RowDiff, movesARowByTakingItOutAndPuttingItIn) {
  EXPECT_EQ(rowsTouched(steps("abcde", "bcdea")), 2U);
}

TEST(RowDiff, alwaysArrivesAtTheNewList) {
  std::mt19937 random(17);
  const auto text = [&random] {
    std::string rows(random() % 12, ' ');
    for (char& row : rows) row = static_cast<char>('a' + random() % 5);
    return rows;
  };
  for (int round = 0; round < 2000; ++round) {
    const std::string before = text();
    const std::string after = text();
    const auto all = steps(before, after);
    ASSERT_EQ(applied(before, after, all), after) << before << " to " << after;
  }
}

TEST(RowDiff, replacesTheMiddleOfVeryLongListsThatDifferAllOver) {
  const std::string before(3000, 'a');
  const std::string after(3000, 'b');
  const auto all = steps("[" + before + "]", "[" + after + "]");
  EXPECT_EQ(all, (std::vector<RowStep>{{Kind::remove, 1, 3000}, {Kind::insert, 1, 3000}}));
}

}  // namespace
}  // namespace qel
