#include "base/TerminalText.h"

#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdint>

#include "base/NonBlockingWriter.h"
#include "base/Utf8.h"

namespace qel {
namespace {

struct Range {
  char32_t first;
  char32_t last;
};

constexpr std::array kObeyed = {
    Range{0x00, 0x1F},                             // C0
    Range{0x7F, 0x9F},                             // delete, C1
    Range{0x061C, 0x061C},                         // marks of direction
    Range{0x200E, 0x200F}, Range{0x2028, 0x2029},  // line and paragraph separator
    Range{0x202A, 0x202E},                         // embeddings and overrides of direction
    Range{0x2066, 0x2069},                         // isolates
};

bool isObeyed(char32_t character) {
  return std::ranges::any_of(kObeyed, [character](const Range& range) {
    return character >= range.first && character <= range.last;
  });
}

// Of a valid sequence, by its first byte.
std::size_t lengthOf(unsigned char lead) {
  if (lead < 0x80) return 1;
  if (lead < 0xE0) return 2;
  return lead < 0xF0 ? 3 : 4;
}

char32_t characterOf(std::string_view sequence) {
  constexpr std::array<unsigned, 4> kLeadBits = {0x7F, 0x1F, 0x0F, 0x07};
  char32_t character =
      static_cast<unsigned char>(sequence.front()) & kLeadBits[sequence.size() - 1];
  for (const char byte : sequence.substr(1)) {
    character = character << 6 | (static_cast<unsigned char>(byte) & 0x3FU);
  }
  return character;
}

void appendEscaped(std::string& out, char32_t character) {
  out += "\\u";
  for (int shift = 12; shift >= 0; shift -= 4) out += "0123456789abcdef"[character >> shift & 0xF];
}

}  // namespace

std::string forTerminal(std::string_view text, Instead instead) {
  const bool isPlain = std::ranges::all_of(text, [](char c) { return c >= ' ' && c < 0x7F; });
  if (isPlain) return std::string(text);
  const std::string valid = withReplacements(text);
  std::string out;
  for (std::string_view left = valid; !left.empty();) {
    const std::string_view sequence =
        left.substr(0, lengthOf(static_cast<unsigned char>(left.front())));
    const char32_t character = characterOf(sequence);
    if (!isObeyed(character)) {
      out += sequence;
    } else if (instead == Instead::blank) {
      out += ' ';
    } else {
      appendEscaped(out, character);
    }
    left.remove_prefix(sequence.size());
  }
  return out;
}

void complain(std::string_view program, std::string_view text) {
  constexpr auto kMoment = std::chrono::seconds(1);
  std::string line(program);
  line += ": ";
  line += forTerminal(text);
  line += '\n';
  writeBriefly(STDERR_FILENO, line, kMoment);
}

}  // namespace qel
