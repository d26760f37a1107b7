// A line that names a metric and has a payload of it: {"metric": 19972, "payload": "08e807"}.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <variant>

#include "base/Bytes.h"

namespace qel {

struct PayloadLine {
  std::int64_t metric = -1;  // a number that is no 64-bit integer is that of no metric: -1
  Bytes payload;
};

// Any JSON object with both, or why it is none. In linear time.
std::variant<PayloadLine, std::string> parsePayloadLine(std::string_view line);

}  // namespace qel
