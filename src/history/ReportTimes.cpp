#include "history/ReportTimes.h"

#include <algorithm>
#include <limits>

namespace qel {
namespace {

constexpr std::uint64_t kShortestGapMs = 5000;
constexpr std::uint64_t kSilentPeriods = 3;
constexpr std::uint32_t kFewestDistances = 5;
// Of a metric that comes faster it is not known whether it was alive.
constexpr std::uint64_t kShortestPeriodMs = 100;

}  // namespace

std::optional<std::uint64_t> ReportTimes::note(std::size_t number, std::uint64_t atMs) {
  Metric& metric = _metrics[number];
  std::optional<std::uint64_t> gap;
  if (_lastMs && atMs - *_lastMs > kShortestGapMs && isGap(atMs - *_lastMs)) {
    gap = atMs - *_lastMs;
  }
  if (metric.lastMs != 0) {
    constexpr std::uint64_t kMost = std::numeric_limits<std::uint32_t>::max();
    metric.distancesMs[metric.count++ % metric.distancesMs.size()] =
        static_cast<std::uint32_t>(std::min(atMs - metric.lastMs, kMost));
  }
  metric.lastMs = atMs;
  _lastMs = atMs;
  return gap;
}

void ReportTimes::forget() { *this = {}; }

std::optional<std::uint64_t> ReportTimes::regularPeriodMs(const Metric& metric) {
  const std::size_t known = std::min<std::size_t>(metric.count, metric.distancesMs.size());
  if (known < kFewestDistances) return std::nullopt;
  auto sorted = metric.distancesMs;
  const auto end = sorted.begin() + static_cast<std::ptrdiff_t>(known);
  std::sort(sorted.begin(), end);
  const std::uint64_t middle = sorted[known / 2];
  const auto alike = std::count_if(sorted.begin(), end, [middle](std::uint64_t distance) {
    return distance >= middle / 2 && distance <= 2 * middle;
  });
  const bool isRegular = middle > 0 && 4 * static_cast<std::size_t>(alike) >= 3 * known;
  return isRegular ? std::optional(middle) : std::nullopt;
}

bool ReportTimes::isGap(std::uint64_t silenceMs) const {
  return std::ranges::any_of(_metrics, [&](const Metric& metric) {
    const auto period = regularPeriodMs(metric);
    if (!period || silenceMs <= kSilentPeriods * *period) return false;
    const std::uint64_t alive = kSilentPeriods * std::max(*period, kShortestPeriodMs);
    return *_lastMs - metric.lastMs <= alive;
  });
}

}  // namespace qel
