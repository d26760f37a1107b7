// When reports came, and whether all of them have been silent.
#pragma once

#include <algorithm>
#include <array>
#include <cstdint>
#include <optional>

namespace qel {

// A metric is regular when most of its last distances are about the same; only the silence of a
// regular one means something, as others come when something changes.
class ReportTimes {
 public:
  static constexpr std::size_t kMetrics = 32;

  // A report of the metric (a number below kMetrics); its time never goes back. Answers how long
  // all had been silent, if that was longer than three periods of a regular one and five seconds;
  // else 0.
  std::uint64_t note(std::size_t number, std::uint64_t atMs) {
    const std::uint64_t silenceMs = noteOther(atMs);
    Metric& metric = _metrics.data()[number];
    if (atMs - metric.lastMs >= kShortestMs) metric.note(atMs);
    return silenceMs;
  }
  // The same of a report that is none of them.
  std::uint64_t noteOther(std::uint64_t atMs) {
    const std::uint64_t silenceMs = silenceUntil(atMs);
    _lastMs = atMs;
    return silenceMs;
  }
  // Silence before the next one means nothing.
  void forget() { _metrics = {}; }

  // 0: none came yet.
  std::uint64_t lastMs() const { return _lastMs; }

 private:
  static constexpr std::uint64_t kShortestGapMs = 5000;
  static constexpr std::size_t kDistances = 8;
  static constexpr std::uint64_t kShortestMs = 100;  // what comes sooner is not looked at
  static constexpr std::uint64_t kLongestMs = ~std::uint32_t{0};

  struct Metric {
    void note(std::uint64_t atMs) {
      const std::uint64_t distance = std::min(atMs - lastMs, kLongestMs);
      distancesMs.data()[count++ % kDistances] = static_cast<std::uint32_t>(distance);
      lastMs = atMs;
    }
    std::uint64_t lastMs = 0;
    std::uint32_t count = 0;  // ever noted
    std::array<std::uint32_t, kDistances> distancesMs{};
  };

  std::uint64_t silenceUntil(std::uint64_t atMs) const {
    const std::uint64_t silenceMs = atMs - _lastMs;
    return silenceMs > kShortestGapMs && isTooLong(silenceMs) ? silenceMs : 0;
  }
  static std::optional<std::uint64_t> regularPeriodMs(const Metric& metric);
  bool isTooLong(std::uint64_t silenceMs) const;

  std::array<Metric, kMetrics> _metrics;
  std::uint64_t _lastMs = 0;
};

}  // namespace qel
