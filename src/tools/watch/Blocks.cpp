#include "tools/watch/Blocks.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <optional>

namespace qel::watch {
namespace {

constexpr std::size_t kEighths = 8;
constexpr std::array<const char*, kEighths + 1> kBlocks = {" ", "▁", "▂", "▃", "▄",
                                                           "▅", "▆", "▇", "█"};

struct Column {
  double sum = 0;
  std::size_t count = 0;
};

// The mean of each column; none where nothing was reported.
std::vector<std::optional<double>> means(const std::vector<Run>& runs, const BlockFrame& frame) {
  std::vector<Column> columns(frame.columns);
  std::vector<std::optional<double>> result(frame.columns);
  for (const Run& run : runs) {
    std::optional<std::size_t> last;
    for (const Point& point : run) {
      if (point.timeMs < frame.fromMs || point.timeMs > frame.toMs) continue;
      const std::size_t at = columnOf(point.timeMs, frame);
      for (std::size_t between = last.value_or(at) + 1; between < at; ++between) {
        result[between] = result[*last];
      }
      columns[at].sum += static_cast<double>(point.value);
      ++columns[at].count;
      result[at] = columns[at].sum / static_cast<double>(columns[at].count);
      last = at;
    }
  }
  return result;
}

// How many eighths of so many lines a value fills: at least one, so that it is seen.
std::size_t eighthsOf(double value, const BlockFrame& frame, std::size_t lines) {
  const double height = static_cast<double>(lines * kEighths);
  const double range = static_cast<double>(frame.highest) - static_cast<double>(frame.lowest);
  const double share = range > 0 ? (value - static_cast<double>(frame.lowest)) / range : 0.5;
  return static_cast<std::size_t>(std::clamp(std::round(share * height), 1.0, height));
}

}  // namespace

std::size_t columnOf(std::uint64_t timeMs, const BlockFrame& frame) {
  const std::uint64_t span = std::max<std::uint64_t>(1, frame.toMs - frame.fromMs);
  const std::uint64_t into = std::clamp(timeMs, frame.fromMs, frame.toMs) - frame.fromMs;
  return std::min(static_cast<std::size_t>(into * frame.columns / span), frame.columns - 1);
}

std::vector<std::string> bars(const std::vector<Run>& runs, const BlockFrame& frame,
                              std::size_t lines) {
  std::vector<std::string> result(lines);
  if (frame.columns == 0) return result;
  for (const auto& mean : means(runs, frame)) {
    const std::size_t filled = mean ? eighthsOf(*mean, frame, lines) : 0;
    for (std::size_t line = 0; line < lines; ++line) {
      const std::size_t below = (lines - 1 - line) * kEighths;
      result[line] += kBlocks.at(std::min(kEighths, filled - std::min(filled, below)));
    }
  }
  return result;
}

std::string sparkline(const std::vector<Run>& runs, const BlockFrame& frame) {
  return bars(runs, frame, 1).front();
}

}  // namespace qel::watch
