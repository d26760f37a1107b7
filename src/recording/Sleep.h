// Where the device slept while a recording was made, and nothing could come.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string_view>

#include "recording/RecordedEvent.h"

namespace qel {

// A sleep is a trigger at its end with its length under this key. Whoever does not know it keeps it
// and goes on.
inline constexpr std::string_view kRecordedSleepKey = "asleep_ms";

inline RecordedEvent sleepEvent(std::uint64_t timeMs, std::chrono::milliseconds asleep) {
  RecordedEvent event{timeMs, RecordedKind::trigger, {}};
  event.entries.set(kRecordedSleepKey, static_cast<std::uint64_t>(asleep.count()));
  return event;
}

// Its length; nothing for any other event, and for a length that no clock could tell.
inline std::optional<std::chrono::milliseconds> sleepOf(const RecordedEvent& event) {
  constexpr std::uint64_t kLongestMs = std::uint64_t{1} << 50U;
  if (event.kind != RecordedKind::trigger) return std::nullopt;
  const Value* length = event.entries.find(kRecordedSleepKey);
  const auto lengthMs = length ? length->asUInt64() : std::nullopt;
  if (!lengthMs || *lengthMs > kLongestMs) return std::nullopt;
  return std::chrono::milliseconds(static_cast<std::int64_t>(*lengthMs));
}

}  // namespace qel
