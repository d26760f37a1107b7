#include "base/Utf8.h"

#include <cstddef>
#include <cstdint>

namespace qel {
namespace {

struct CodeLength {
  std::size_t length;  // bytes taken, at least 1
  bool valid;
};

// The sequence that starts at the front of `text` (Unicode 15, table 3-7). `text` is not empty.
CodeLength firstSequence(std::string_view text) {
  const auto byteAt = [text](std::size_t i) { return static_cast<std::uint8_t>(text[i]); };
  const std::uint8_t lead = byteAt(0);
  if (lead < 0x80) return {1, true};
  std::size_t length = 0;
  std::uint8_t low = 0x80;
  std::uint8_t high = 0xBF;
  if (lead >= 0xC2 && lead <= 0xDF) {
    length = 2;
  } else if (lead >= 0xE0 && lead <= 0xEF) {
    length = 3;
    if (lead == 0xE0) low = 0xA0;
    if (lead == 0xED) high = 0x9F;
  } else if (lead >= 0xF0 && lead <= 0xF4) {
    length = 4;
    if (lead == 0xF0) low = 0x90;
    if (lead == 0xF4) high = 0x8F;
  } else {
    return {1, false};
  }
  for (std::size_t i = 1; i < length; ++i) {
    if (i >= text.size() || byteAt(i) < low || byteAt(i) > high) return {i, false};
    low = 0x80;
    high = 0xBF;
  }
  return {length, true};
}

}  // namespace

bool isValidUtf8(std::string_view text) {
  while (!text.empty()) {
    const CodeLength sequence = firstSequence(text);
    if (!sequence.valid) return false;
    text.remove_prefix(sequence.length);
  }
  return true;
}

std::string withReplacements(std::string_view text) {
  std::string out;
  out.reserve(text.size());
  while (!text.empty()) {
    const CodeLength sequence = firstSequence(text);
    out += sequence.valid ? text.substr(0, sequence.length) : "\xEF\xBF\xBD";
    text.remove_prefix(sequence.length);
  }
  return out;
}

}  // namespace qel
