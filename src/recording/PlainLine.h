// The short way to read the line of an event.
#pragma once

#include <optional>
#include <string_view>

#include "recording/RecordedEvent.h"

namespace qel {

// The event of a line that has a time and a kind and is plain: one object with each key once, its
// values whole numbers of at most 18 digits or texts of printable ASCII without escapes, as nearly
// every line of a recording is. Nothing for any other line, good or bad: the JSON parser judges it.
std::optional<RecordedEvent> readPlainLine(std::string_view line);

}  // namespace qel
