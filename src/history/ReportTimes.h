// When reports came, and whether all of them have been silent.
#pragma once

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
  // all had been silent, if that was longer than three periods of a regular one and five seconds.
  std::optional<std::uint64_t> note(std::size_t metric, std::uint64_t atMs);
  // One of none of them.
  void noteOther(std::uint64_t atMs) { _lastMs = atMs; }
  // Silence before the next one means nothing.
  void forget();

  std::optional<std::uint64_t> lastMs() const { return _lastMs; }

 private:
  struct Metric {
    std::uint64_t lastMs = 0;
    std::uint32_t count = 0;  // of distances ever seen
    std::array<std::uint32_t, 8> distancesMs{};
  };

  static std::optional<std::uint64_t> regularPeriodMs(const Metric& metric);
  bool isGap(std::uint64_t silenceMs) const;

  std::array<Metric, kMetrics> _metrics;
  std::optional<std::uint64_t> _lastMs;
};

}  // namespace qel
