// The text form of one recorded event: a JSON object on a line.
#pragma once

#include <string>
#include <string_view>
#include <variant>

#include "recording/JsonLine.h"
#include "recording/RecordedEvent.h"

namespace qel {

// In linear time. Whatever is wrong with the line, beyond its limits too, is a fault.
std::variant<RecordedEvent, LineFault> parseEventLine(std::string_view line);

// Whether a reader takes the line of the event for it, if the line is not too long.
bool hasReadableForm(const RecordedEvent& event);

// Without the newline. Bytes other than the payload are written as their "<hex>" text.
std::string eventLine(const RecordedEvent& event);

}  // namespace qel
