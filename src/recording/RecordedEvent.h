// One event of a recording.
#pragma once

#include <cstdint>
#include <string_view>

#include "base/Dictionary.h"

namespace qel {

enum class RecordedKind : std::uint8_t { metric, trigger };

struct RecordedEvent {
  std::uint64_t timeMs = 0;  // when the event was received, since 1970-01-01 00:00 UTC
  RecordedKind kind = RecordedKind::metric;
  Dictionary entries;  // the event dictionary, keys in order; the payload as bytes
};

// The keys of the event dictionary that a recording knows; any other one is kept as it came.
inline constexpr std::string_view kRecordedMetricKey = "kKeyMetricID";
inline constexpr std::string_view kRecordedPayloadKey = "kKeyPayload";

}  // namespace qel
