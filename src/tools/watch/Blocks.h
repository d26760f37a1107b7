// Curves of block characters.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "history/Series.h"

namespace qel::watch {

// What a curve is drawn into.
struct BlockFrame {
  std::uint64_t fromMs = 0;
  std::uint64_t toMs = 0;
  float lowest = 0;
  float highest = 0;
  std::size_t columns = 0;
};

// One line: the mean of each column as one of eight blocks, a blank where nothing was reported. A
// column between two points of a run shows the earlier one.
std::string sparkline(const std::vector<Run>& runs, const BlockFrame& frame);

// The same over several lines, the highest first.
std::vector<std::string> bars(const std::vector<Run>& runs, const BlockFrame& frame,
                              std::size_t lines);

// The column of a time; none outside.
std::size_t columnOf(std::uint64_t timeMs, const BlockFrame& frame);

}  // namespace qel::watch
