// Where a row stands in a table: section and row, both counted from 0.
#pragma once

#include <compare>

namespace qel {

struct IndexPath {
  int section = 0;
  int row = 0;

  friend auto operator<=>(const IndexPath&, const IndexPath&) = default;
};

}  // namespace qel
