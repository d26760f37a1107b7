#include "history/Series.h"

#include <algorithm>
#include <limits>

namespace qel {
namespace {

constexpr std::uint64_t kSilentDistances = 3;

}  // namespace

void Series::Row::beginChunk() {
  Chunk& chunk = _chunks.emplace_back();
  _next = chunk.data();
  _end = _next + chunk.size();
}

std::size_t Series::Row::until(std::uint64_t timeMs) const {
  std::size_t first = 0;
  for (std::size_t count = size(); count > 0;) {
    const std::size_t half = count / 2;
    if ((*this)[first + half].timeMs() <= timeMs) {
      first += half + 1;
      count -= half + 1;
    } else {
      count = half;
    }
  }
  return first;
}

void Series::addAnew(std::uint64_t timeMs, float value) {
  timeMs = std::max(timeMs, _lastMs);
  const std::uint64_t distance = timeMs - _lastMs;
  if (distance > kShortestSilenceMs && isSilence(distance)) interrupt();
  if (timeMs >= _mean.endMs) beginMean(timeMs);
  _lastMs = timeMs;
  push({timeMs, value, std::exchange(_isInterrupted, false)});
}

// By the middle one of the last eight distances. Before three are known nothing is usual, and five
// seconds are a silence.
bool Series::isSilence(std::uint64_t distanceMs) const {
  std::array<std::uint64_t, 8> distances;
  std::size_t known = 0;
  for (std::size_t i = _recent.size(); i-- > 1 && known < distances.size();) {
    const std::uint64_t distance = _recent[i].timeMs() - _recent[i - 1].timeMs();
    if (distance > 0) distances[known++] = distance;
  }
  if (known < 3) return true;
  const auto middle = distances.begin() + static_cast<std::ptrdiff_t>(known / 2);
  std::nth_element(distances.begin(), middle,
                   distances.begin() + static_cast<std::ptrdiff_t>(known));
  return distanceMs > kSilentDistances * *middle;
}

// The newest chunk stays.
void Series::dropOld() {
  const auto isTooMuch = [&] {
    const bool isOld = _lastMs - _recent.firstChunk().back().timeMs() > _limits.recentMs;
    return isOld || _recent.size() > _limits.mostRecent;
  };
  while (_recent.size() > Row::kChunk && isTooMuch()) _recent.dropFirstChunk();
}

void Series::beginMean(std::uint64_t timeMs) {
  if (_mean.count > 0 && _limits.dayMs > 0) _day.push(_mean.point(_lastMs));
  while (_day.size() > Row::kChunk && timeMs - _day.firstChunk().back().timeMs() > _limits.dayMs) {
    _day.dropFirstChunk();
  }
  _mean = {timeMs, timeMs + _limits.dayStepMs, 0, 0, _isInterrupted};
}

Series::Kept Series::Mean::point(std::uint64_t lastMs) const {
  return {fromMs + (lastMs - fromMs) / 2, static_cast<float>(sum / count), begins};
}

// The run of the first point that is known itself began behind the last mean before that point.
bool Series::isCutOffFromMeans() const {
  const std::uint64_t firstMs = _recent[0].timeMs();
  const std::size_t next = _day.until(firstMs - 1);
  if (next == _day.size()) return _mean.begins && _mean.fromMs < firstMs;
  if (!_day[next].begins()) return false;
  for (std::size_t i = _recent.until(_day[next].timeMs()); i-- > 0;) {
    if (_recent[i].begins()) return false;  // that is where it began
  }
  return true;
}

std::vector<Run> Series::between(std::uint64_t fromMs, std::uint64_t toMs) const {
  std::vector<Run> runs;
  bool isCutOff = false;
  // `most` are to come with it, most often in one run.
  const auto append = [&](const Kept& point, std::size_t most) {
    if (point.timeMs() < fromMs || point.timeMs() > toMs) return;
    if (runs.empty()) {
      runs.emplace_back().reserve(most);
    } else if (point.begins() || isCutOff) {
      runs.emplace_back();
    }
    isCutOff = false;
    runs.back().push_back({point.timeMs(), point.value});
  };
  const auto appendRow = [&](const Row& row, std::uint64_t untilMs) {
    const std::size_t end = row.until(untilMs);
    for (std::size_t i = fromMs == 0 ? 0 : row.until(fromMs - 1); i < end; ++i) {
      append(row[i], end - i);
    }
  };
  // Means until the first point that is known itself.
  if (_recent.size() > 0 && _recent[0].timeMs() > fromMs) {
    appendRow(_day, std::min(toMs, _recent[0].timeMs() - 1));
    isCutOff = isCutOffFromMeans();
  }
  appendRow(_recent, toMs);
  return runs;
}

std::optional<Point> Series::last(std::uint64_t atMs) const {
  const auto pointOf = [](const Kept& kept) { return Point{kept.timeMs(), kept.value}; };
  if (const std::size_t count = _recent.until(atMs); count > 0) return pointOf(_recent[count - 1]);
  if (const std::size_t count = _day.until(atMs); count > 0) return pointOf(_day[count - 1]);
  return std::nullopt;
}

}  // namespace qel
