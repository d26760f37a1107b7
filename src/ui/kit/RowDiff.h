// What must be taken out of and put into a list of rows to make it another.
#pragma once

#include <cstddef>
#include <functional>
#include <vector>

namespace qel {

// Rows [first, first + count): of the list as it stands after the steps before, for a removal; of
// the new list, for an insertion.
struct RowStep {
  enum class Kind { remove, insert };
  Kind kind;
  std::size_t first;
  std::size_t count;

  friend bool operator==(const RowStep&, const RowStep&) = default;
};

// Are the old row and the new row, each by its position, the same row?
using SameRow = std::function<bool(std::size_t before, std::size_t after)>;

// Removals from the back to the front, then insertions from the front to the back. As few rows as
// possible, save where very long lists differ all over: then the stretch that differs is replaced.
std::vector<RowStep> rowSteps(std::size_t before, std::size_t after, const SameRow& same);

}  // namespace qel
