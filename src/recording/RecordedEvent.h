// One event of a recording.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string_view>

#include "base/Value.h"
#include "messages/catalogue/EventNames.h"

namespace qel {

enum class RecordedKind : std::uint8_t { metric, trigger };

// Later ones have no date: a line with one is a bad line.
inline constexpr std::uint64_t kLastRecordedMs = 253402300799999;  // of the year 9999

struct RecordedEvent {
  std::uint64_t timeMs = 0;  // when the event was received, since 1970-01-01 00:00 UTC
  RecordedKind kind = RecordedKind::metric;
  Dictionary entries;  // the event dictionary, keys in order; the payload as bytes
};

// The keys of a line that say what the event is, and the words for its kind.
inline constexpr std::string_view kRecordedTimeKey = "time_ms";
inline constexpr std::string_view kRecordedEventKey = "event";
struct RecordedKindName {
  RecordedKind kind;
  std::string_view name;
};
inline constexpr std::array kRecordedKindNames = {
    RecordedKindName{RecordedKind::metric, "metric"},
    RecordedKindName{RecordedKind::trigger, "trigger"},
};

constexpr std::optional<RecordedKind> recordedKind(std::string_view name) {
  for (const RecordedKindName& row : kRecordedKindNames) {
    if (row.name == name) return row.kind;
  }
  return std::nullopt;
}

// The keys of the event dictionary that a recording knows; any other one is kept as it came.
inline constexpr std::string_view kRecordedMetricKey = tesk::kKeyMetricID;
inline constexpr std::string_view kRecordedPayloadKey = tesk::kKeyPayload;

}  // namespace qel
