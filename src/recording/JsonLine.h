// The general way to read the line of an event: any JSON object within the limits of a line.
#pragma once

#include <string>
#include <string_view>
#include <variant>

#include "base/Value.h"

namespace qel {

// Why a line is no event. A line that is no JSON at all may be one that was cut off.
struct LineFault {
  bool isJson = false;
  std::string reason;
};

// The line as a dictionary. Of a key that comes again the last value counts. In linear time, with
// memory in proportion to the line; whatever the JSON parser has to say is a fault.
std::variant<Dictionary, LineFault> parseJsonLine(std::string_view line);

// The text in quotes, cut to what a message can hold.
std::string quoted(std::string_view text);

}  // namespace qel
