// Options that take a span of time.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace CLI {
class Validator;
}

namespace qel::tools {

// "10s", "250ms", "1.5m", "2h" or "14d", or a number of seconds: in milliseconds. Nothing for
// whatever else and beyond a hundred years.
std::optional<std::uint64_t> millisecondsIn(std::string_view text);

// Turns the text of an option into that number.
CLI::Validator asMilliseconds();

}  // namespace qel::tools
