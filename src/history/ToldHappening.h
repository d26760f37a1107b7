// What a recording tells of by itself, besides its reports, as something that happened.
#pragma once

#include <optional>

#include "base/Amounts.h"
#include "history/Happening.h"
#include "recording/Mark.h"
#include "recording/Sleep.h"

namespace qel {

// A mark, or a sleep of the device that recorded. Nothing for any other event.
inline std::optional<Happening> happeningToldBy(const RecordedEvent& event) {
  Happening happening;
  happening.timeMs = event.timeMs;
  if (const auto number = markOf(event)) {
    happening.kind = HappeningKind::mark;
    happening.text = markText(*number);
  } else if (const auto asleep = sleepOf(event)) {
    happening.kind = HappeningKind::gap;
    happening.text = "Nothing was recorded for " +
                     durationText(std::chrono::duration_cast<std::chrono::seconds>(*asleep)) +
                     ": the device slept";
  } else {
    return std::nullopt;
  }
  return happening;
}

}  // namespace qel
