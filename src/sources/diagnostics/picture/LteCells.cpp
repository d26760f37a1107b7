#include "sources/diagnostics/picture/LteCells.h"

#include <algorithm>

namespace qel::diagnostics {

void LteNeighbours::note(const LteNeighbour& neighbour) {
  const auto known = std::find_if(_cells.begin(), _cells.end(), [&](const LteNeighbour& cell) {
    return cell.cell == neighbour.cell;
  });
  if (known != _cells.end()) {
    *known = neighbour;
    return;
  }
  if (_cells.size() == kMost) {
    _cells.erase(std::min_element(_cells.begin(), _cells.end(), [](const auto& a, const auto& b) {
      return a.timeMs < b.timeMs;
    }));
  }
  _cells.push_back(neighbour);
}

}  // namespace qel::diagnostics
