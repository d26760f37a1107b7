#include "service/ClientName.h"

#include <algorithm>
#include <array>

#include "base/Utf8.h"
#include "service/Limits.h"

namespace qel::service {
namespace {

static_assert(limits::kClientNameBytes == 64, "the message names the limit");

bool isControl(char c) {
  const auto byte = static_cast<unsigned char>(c);
  return byte < 0x20 || byte == 0x7F;
}

// In a text that is UTF-8: U+0080 to U+009F, and what Unicode calls line and paragraph separators,
// directional marks, embeddings, overrides and isolates.
bool hasHiddenCharacter(std::string_view text) {
  constexpr std::array<std::string_view, 3> kSingles = {"\xD8\x9C", "\xE2\x80\x8E", "\xE2\x80\x8F"};
  const auto holdsRange = [text](std::string_view lead, unsigned char first, unsigned char last) {
    for (auto at = text.find(lead); at != std::string_view::npos; at = text.find(lead, at + 1)) {
      const auto byte = static_cast<unsigned char>(text[at + lead.size()]);
      if (byte >= first && byte <= last) return true;
    }
    return false;
  };
  return holdsRange("\xC2", 0x80, 0x9F) || holdsRange("\xE2\x80", 0xA8, 0xAE) ||
         holdsRange("\xE2\x81", 0xA6, 0xA9) ||
         std::ranges::any_of(kSingles, [text](std::string_view single) {
           return text.find(single) != std::string_view::npos;
         });
}

}  // namespace

std::string_view faultOfClientName(std::string_view name) {
  if (name.empty()) return "the client name is empty";
  if (name.size() > limits::kClientNameBytes) return "the client name is longer than 64 bytes";
  if (!isValidUtf8(name)) return "the client name is not UTF-8";
  if (std::ranges::any_of(name, isControl) || hasHiddenCharacter(name)) {
    return "the client name has control characters";
  }
  return {};
}

}  // namespace qel::service
