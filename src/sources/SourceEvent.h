// What a source tells: a metric, or a trigger.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "base/Value.h"
#include "messages/catalogue/EventNames.h"

namespace qel::sources {

struct SourceEvent {
  std::uint64_t timeMs = 0;  // of the source, since 1970-01-01 00:00 UTC
  std::string_view stream;   // tesk::kEventMetric or tesk::kEventTrigger
  Dictionary entries;
};

// A metric's, by its 16-bit identifier.
SourceEvent metricEvent(std::uint32_t metric, Bytes payload, std::uint64_t timeMs);
// The identifier; nothing when the event is no metric's.
std::optional<std::uint32_t> metricOf(const SourceEvent& event);

}  // namespace qel::sources
