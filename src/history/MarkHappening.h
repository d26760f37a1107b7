// A mark of a recording as something that happened.
#pragma once

#include <optional>

#include "history/Happening.h"
#include "recording/Mark.h"

namespace qel {

// Nothing for an event that is no mark.
inline std::optional<Happening> happeningOfMark(const RecordedEvent& event) {
  const auto number = markOf(event);
  if (!number) return std::nullopt;
  Happening happening;
  happening.timeMs = event.timeMs;
  happening.kind = HappeningKind::mark;
  happening.text = markText(*number);
  return happening;
}

}  // namespace qel
