#include "history/Series.h"

#include <algorithm>
#include <limits>

namespace qel {
namespace {

constexpr std::uint64_t kShortestSilenceMs = 5000;
constexpr std::uint64_t kSilentDistances = 3;

}  // namespace

void Series::add(std::uint64_t timeMs, float value) {
  const std::uint64_t last = _recent.empty() ? timeMs : _recent.back().timeMs();
  timeMs = std::max(timeMs, last);
  const std::uint64_t distance = timeMs - last;
  if (distance > kShortestSilenceMs && isSilence(distance)) _isInterrupted = true;
  if (distance > 0) {
    constexpr std::uint64_t kMost = std::numeric_limits<std::uint32_t>::max();
    _distancesMs[_distances++ % _distancesMs.size()] =
        static_cast<std::uint32_t>(std::min(distance, kMost));
  }
  _recent.emplace_back(timeMs, value, _isInterrupted);
  _isInterrupted = false;
  while (_recent.size() > _limits.mostRecent ||
         timeMs - _recent.front().timeMs() > _limits.recentMs) {
    dropOldest();
  }
}

// Before three distances are known nothing is usual, and five seconds are a silence.
bool Series::isSilence(std::uint64_t distanceMs) const {
  const std::size_t known = std::min<std::size_t>(_distances, _distancesMs.size());
  if (known < 3) return true;
  auto sorted = _distancesMs;
  const auto middle = sorted.begin() + static_cast<std::ptrdiff_t>(known / 2);
  std::nth_element(sorted.begin(), middle, sorted.begin() + static_cast<std::ptrdiff_t>(known));
  return distanceMs > kSilentDistances * *middle;
}

void Series::dropOldest() {
  const Kept point = _recent.front();
  _recent.pop_front();
  if (_limits.dayMs == 0) return;
  if (_mean.count > 0 && (point.begins() || point.timeMs() - _mean.fromMs >= _limits.dayStepMs)) {
    finishMean();
  }
  if (_mean.count == 0) _mean = {point.timeMs(), 0, 0, 0, point.begins()};
  _mean.toMs = point.timeMs();
  _mean.sum += point.value;
  ++_mean.count;
}

Series::Kept Series::Mean::point() const {
  return {fromMs + (toMs - fromMs) / 2, static_cast<float>(sum / count), begins};
}

void Series::finishMean() {
  _day.push_back(_mean.point());
  while (_day.back().timeMs() - _day.front().timeMs() > _limits.dayMs) _day.pop_front();
  _mean.count = 0;
}

Series::Row::const_iterator Series::firstAfter(const Row& row, std::uint64_t timeMs) {
  return std::upper_bound(row.begin(), row.end(), timeMs,
                          [](std::uint64_t at, const Kept& point) { return at < point.timeMs(); });
}

std::vector<Run> Series::between(std::uint64_t fromMs, std::uint64_t toMs) const {
  std::vector<Run> runs;
  const auto append = [&](const Kept& point) {
    if (point.timeMs() < fromMs || point.timeMs() > toMs) return;
    if (runs.empty() || point.begins()) runs.emplace_back();
    runs.back().push_back({point.timeMs(), point.value});
  };
  const auto appendRow = [&](const Row& row) {
    const auto first = fromMs == 0 ? row.begin() : firstAfter(row, fromMs - 1);
    std::for_each(first, std::max(first, firstAfter(row, toMs)), append);
  };
  appendRow(_day);
  if (_mean.count > 0) append(_mean.point());
  appendRow(_recent);
  return runs;
}

std::optional<Point> Series::last(std::uint64_t atMs) const {
  const auto before = [atMs](const Row& row) -> std::optional<Point> {
    const auto after = firstAfter(row, atMs);
    if (after == row.begin()) return std::nullopt;
    return Point{std::prev(after)->timeMs(), std::prev(after)->value};
  };
  if (const auto point = before(_recent)) return point;
  if (_mean.count > 0 && _mean.point().timeMs() <= atMs) {
    return Point{_mean.point().timeMs(), _mean.point().value};
  }
  return before(_day);
}

}  // namespace qel
