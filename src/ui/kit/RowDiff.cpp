#include "ui/kit/RowDiff.h"

#include <algorithm>
#include <cstdint>

namespace qel {
namespace {

// The stretch in which two lists differ, once their common ends are set aside.
struct Stretch {
  std::size_t first = 0;
  std::size_t before = 0;  // rows of the old list
  std::size_t after = 0;   // rows of the new list
};

constexpr std::size_t kMostComparisons = 1'000'000;

Stretch differingStretch(std::size_t before, std::size_t after, const SameRow& same) {
  const std::size_t shorter = std::min(before, after);
  std::size_t head = 0;
  while (head < shorter && same(head, head)) ++head;
  std::size_t tail = 0;
  while (tail < shorter - head && same(before - 1 - tail, after - 1 - tail)) ++tail;
  return {head, before - head - tail, after - head - tail};
}

// Marks the rows of both lists that the longest common subsequence keeps.
void markKept(const Stretch& stretch, const SameRow& same, std::vector<bool>& keptBefore,
              std::vector<bool>& keptAfter) {
  const std::size_t width = stretch.after + 1;
  std::vector<std::uint32_t> longest((stretch.before + 1) * width, 0);
  const auto at = [width](std::size_t i, std::size_t j) { return i * width + j; };
  for (std::size_t i = stretch.before; i-- > 0;) {
    for (std::size_t j = stretch.after; j-- > 0;) {
      longest[at(i, j)] = same(stretch.first + i, stretch.first + j)
                              ? longest[at(i + 1, j + 1)] + 1
                              : std::max(longest[at(i + 1, j)], longest[at(i, j + 1)]);
    }
  }
  std::size_t i = 0;
  std::size_t j = 0;
  while (i < stretch.before && j < stretch.after) {
    if (same(stretch.first + i, stretch.first + j)) {
      keptBefore[i++] = true;
      keptAfter[j++] = true;
    } else if (longest[at(i + 1, j)] >= longest[at(i, j + 1)]) {
      ++i;
    } else {
      ++j;
    }
  }
}

// The runs of rows that are not kept, front to back.
std::vector<RowStep> runs(const std::vector<bool>& kept, std::size_t offset, RowStep::Kind kind) {
  std::vector<RowStep> steps;
  for (std::size_t i = 0; i < kept.size(); ++i) {
    if (kept[i]) continue;
    if (i > 0 && !kept[i - 1]) {
      ++steps.back().count;
    } else {
      steps.push_back({kind, offset + i, 1});
    }
  }
  return steps;
}

}  // namespace

std::vector<RowStep> rowSteps(std::size_t before, std::size_t after, const SameRow& same) {
  const Stretch stretch = differingStretch(before, after, same);
  std::vector<bool> keptBefore(stretch.before, false);
  std::vector<bool> keptAfter(stretch.after, false);
  if (stretch.before * stretch.after <= kMostComparisons) {
    markKept(stretch, same, keptBefore, keptAfter);
  }
  std::vector<RowStep> steps = runs(keptBefore, stretch.first, RowStep::Kind::remove);
  std::reverse(steps.begin(), steps.end());
  const std::vector<RowStep> inserts = runs(keptAfter, stretch.first, RowStep::Kind::insert);
  steps.insert(steps.end(), inserts.begin(), inserts.end());
  return steps;
}

}  // namespace qel
