// The curves of one quantity.
#pragma once

#include <vector>

#include "history/Viewpoint.h"
#include "ui/pages/SignalsPage.h"

namespace qel {

// What a chart is drawn of.
struct ChartFrame {
  const Viewpoint& viewpoint;
  std::uint64_t fromMs = 0;
  std::uint64_t toMs = 0;
  unsigned columns = 0;
};

// Those that have a curve within the frame, the technology in use first. `neighbours` have theirs
// in the chart of their technology's level.
std::vector<Chart> chartsOf(const ChartFrame& frame, const std::vector<Neighbour>& neighbours);

// The ends of an axis: about the thresholds of quality, and as much wider as values need it.
struct Axis {
  float lowest = 0;
  float highest = 0;
};
Axis usualAxis(Quantity quantity);
Axis widened(Axis axis, const std::vector<Run>& runs);

// "PCI 123", or the channel of a cell whose code is not known.
std::string labelOf(const Neighbour& neighbour);
std::string idOf(const Neighbour& neighbour);

// Four points for each column that has more: the first, the lowest, the highest and the last.
Run thinned(const Run& run, std::uint64_t fromMs, std::uint64_t toMs, unsigned columns);

}  // namespace qel
