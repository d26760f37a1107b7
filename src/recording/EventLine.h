// The text form of one recorded event: a JSON object on a line.
#pragma once

#include <string>
#include <string_view>
#include <variant>

#include "recording/RecordedEvent.h"

namespace qel {

// Why a line is no event. A line that is no JSON at all may be one that was cut off.
struct LineFault {
  bool isJson = false;
  std::string reason;
};

std::variant<RecordedEvent, LineFault> parseEventLine(std::string_view line);

// Without the newline. Bytes other than the payload are written as their "<hex>" text.
std::string eventLine(const RecordedEvent& event);

}  // namespace qel
