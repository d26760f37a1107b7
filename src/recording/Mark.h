// The marks that somebody sets in a recording while it is made.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "recording/RecordedEvent.h"

namespace qel {

// A mark is a trigger with its number, from 1, under this key. Whoever does not know it keeps it
// and goes on; a number tells nothing about anybody, and so stays where identities are hidden.
inline constexpr std::string_view kRecordedMarkKey = "mark";

inline RecordedEvent markEvent(std::uint64_t timeMs, std::uint64_t number) {
  RecordedEvent event{timeMs, RecordedKind::trigger, {}};
  event.entries.set(kRecordedMarkKey, number);
  return event;
}

// The number of the mark; nothing for any other event.
inline std::optional<std::uint64_t> markOf(const RecordedEvent& event) {
  if (event.kind != RecordedKind::trigger) return std::nullopt;
  const Value* number = event.entries.find(kRecordedMarkKey);
  return number ? number->asUInt64() : std::nullopt;
}

// One line for a reader.
inline std::string markText(std::uint64_t number) { return "Mark " + std::to_string(number); }

}  // namespace qel
