// The catalogue of metric identifiers that the baseband manager uses.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

namespace qel {

struct MetricName {
  std::uint32_t identifier;  // 16 bits; metric events carry it plus kMetricEventBase
  std::string_view name;     // not always the name of a message class
};

// What a metric event adds to a catalogue identifier.
inline constexpr std::uint32_t kMetricEventBase = 0x3C0000;

// The smallest identifiers; every other one is larger than both.
inline constexpr std::uint32_t kSmallestMetric = 19;
inline constexpr std::uint32_t kSecondSmallestMetric = 11788;

class KBBMetricUtility {
 public:
  // All 31, in the order in which the baseband lists them.
  static std::span<const MetricName> catalogue();

  // True when the number names a metric, and says so in the system log. Metric identifiers are
  // recognised in every message alike, whatever its class. Any thread.
  static bool isValidMetricIdTag(std::uint32_t tag, std::string_view messageClass) {
    return mayBeMetric(tag) && look(tag, messageClass);
  }

  // False for most numbers that are no metric, such as nearly all field numbers.
  static constexpr bool mayBeMetric(std::uint32_t tag) {
    return tag == kSmallestMetric || tag >= kSecondSmallestMetric;
  }

 private:
  static bool look(std::uint32_t tag, std::string_view messageClass);
};

}  // namespace qel
