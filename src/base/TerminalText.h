// Text from outside, written for people.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace qel {

// What stands for a character that a terminal obeys.
enum class Instead : std::uint8_t {
  escape,  // \u00XX: within a JSON string the same text
  blank,   // in a table
};

// Valid UTF-8 that a terminal shows and does not obey, on one line: without control characters,
// line separators and characters that turn the direction of text. Bytes that are no UTF-8 become
// U+FFFD.
std::string forTerminal(std::string_view text, Instead instead = Instead::escape);

// "program: text" for a terminal, as one line on standard error. A reader who takes nothing for a
// second loses it.
void complain(std::string_view program, std::string_view text);

}  // namespace qel
