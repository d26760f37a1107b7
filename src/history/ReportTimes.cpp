#include "history/ReportTimes.h"

#include <algorithm>

namespace qel {
namespace {

constexpr std::uint64_t kSilentPeriods = 3;
constexpr std::uint32_t kFewestReports = 6;

}  // namespace

std::optional<std::uint64_t> ReportTimes::regularPeriodMs(const Metric& metric) {
  if (metric.count < kFewestReports) return std::nullopt;
  // The first report has no distance.
  const std::size_t known = std::min<std::size_t>(metric.count - 1, kDistances);
  auto sorted = metric.distancesMs;
  const auto first = sorted.begin() + (metric.count <= kDistances ? 1 : 0);
  const auto end = first + static_cast<std::ptrdiff_t>(known);
  std::sort(first, end);
  const std::uint64_t middle = *(first + static_cast<std::ptrdiff_t>(known / 2));
  const auto alike = std::count_if(first, end, [middle](std::uint64_t distance) {
    return distance >= middle / 2 && distance <= 2 * middle;
  });
  const bool isRegular = middle > 0 && 4 * static_cast<std::size_t>(alike) >= 3 * known;
  return isRegular ? std::optional(middle) : std::nullopt;
}

bool ReportTimes::isTooLong(std::uint64_t silenceMs) const {
  if (_lastMs == 0) return false;
  return std::ranges::any_of(_metrics, [&](const Metric& metric) {
    const auto period = regularPeriodMs(metric);
    if (!period || silenceMs <= kSilentPeriods * *period) return false;
    return _lastMs - metric.lastMs <= kSilentPeriods * *period;
  });
}

}  // namespace qel
