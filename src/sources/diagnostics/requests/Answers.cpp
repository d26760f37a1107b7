#include "sources/diagnostics/requests/Answers.h"

#include <algorithm>

#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {
namespace {

constexpr std::size_t kLongestText = 64;

// Up to a NUL.
std::string textIn(ByteView bytes) {
  std::string text;
  for (const std::uint8_t byte : bytes) {
    if (byte == 0 || text.size() == kLongestText) break;
    if (byte >= ' ' && byte <= '~') text += static_cast<char>(byte);
  }
  while (text.ends_with(' ')) text.pop_back();
  return text;
}

}  // namespace

std::optional<ModemVersion> versionIn(ByteView answer) {
  // command, compile date and time, release date and time, model
  constexpr std::size_t kDate = 11;
  constexpr std::size_t kTime = 8;
  constexpr std::size_t kModelOffset = 1 + 2 * (kDate + kTime);
  constexpr std::size_t kModel = 8;
  if (answer.size() < kModelOffset + kModel) return std::nullopt;
  return ModemVersion{
      textIn(answer.subspan(1, kDate)) + " " + textIn(answer.subspan(1 + kDate, kTime)),
      textIn(answer.subspan(kModelOffset, kModel))};
}

std::optional<ModemBuild> buildIn(ByteView answer) {
  constexpr std::size_t kChipOffset = 4;
  constexpr std::size_t kTextOffset = 12;
  if (answer.size() < kTextOffset) return std::nullopt;
  const ByteView texts = answer.subspan(kTextOffset);
  const auto end = std::ranges::find(texts, 0);
  ModemBuild build{u32At(answer, kChipOffset), textIn(texts), {}};
  if (end != texts.end()) build.model = textIn({end + 1, texts.end()});
  return build;
}

std::optional<LogRanges> rangesIn(ByteView answer) {
  constexpr std::size_t kOffset = 12;
  LogRanges ranges{};
  if (answer.size() < kOffset + 4 * ranges.size()) return std::nullopt;
  for (std::size_t i = 0; i < ranges.size(); ++i) ranges[i] = u32At(answer, kOffset + 4 * i);
  return ranges;
}

bool saysMask(ByteView answer, const LogMask& mask) {
  constexpr std::size_t kItemsOffset = 16;
  constexpr std::size_t kBitsOffset = 20;
  if (answer.size() < kBitsOffset || u32At(answer, kItemsOffset) < mask.items()) return false;
  const ByteView said = answer.subspan(kBitsOffset);
  return said.size() >= mask.bits().size() &&
         std::ranges::equal(said.first(mask.bits().size()), mask.bits());
}

}  // namespace qel::diagnostics
