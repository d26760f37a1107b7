#include "recording/privacy/ImsiLayout.h"

#include <algorithm>
#include <array>

namespace qel {
namespace {

constexpr std::uint8_t kFiller = 0xF;
// 23.003, clause 2.2: at most 15 digits; country and network code alone are no IMSI.
constexpr std::size_t kFewestDigits = 7;
constexpr std::size_t kMostDigits = 15;

// Countries whose network codes have three digits (E.212). Elsewhere two are taken, so that where
// this is wrong a digit too many is replaced, never one too few.
struct Countries {
  unsigned first;
  unsigned last;
};
constexpr std::array kThreeDigitNetworks = {
    Countries{302, 302}, Countries{310, 316}, Countries{334, 334}, Countries{338, 338},
    Countries{342, 342}, Countries{344, 344}, Countries{346, 346}, Countries{348, 348},
    Countries{350, 350}, Countries{352, 352}, Countries{354, 354}, Countries{356, 356},
    Countries{358, 358}, Countries{360, 360}, Countries{365, 366}, Countries{376, 376},
    Countries{708, 708}, Countries{722, 722}, Countries{732, 732},
};

std::uint8_t halfAt(ByteView bytes, std::size_t half) {
  const std::uint8_t byte = bytes[half / 2];
  return half % 2 == 0 ? byte & 0xF : byte >> 4;
}

// 24.008, clause 10.5.1.4: type 1 is IMSI, the bit above says that the digits are odd in number.
bool isImsiType(std::uint8_t half) { return half == 1 || half == 9; }

std::size_t firstDigit(ByteView bytes) {
  if (bytes.size() >= 2 && bytes[0] == bytes.size() - 1 && isImsiType(halfAt(bytes, 2))) return 3;
  // A 9 may also begin 901, the code of networks without a country.
  const bool isInternational =
      bytes.size() >= 2 && halfAt(bytes, 0) == 9 && halfAt(bytes, 1) == 0 && halfAt(bytes, 2) == 1;
  if (!bytes.empty() && isImsiType(halfAt(bytes, 0)) && !isInternational) return 1;
  return 0;
}

// Test networks are 001; others begin with their region, 2 to 7, or are 901.
bool isCountry(unsigned code) { return code == 1 || code == 901 || (code >= 200 && code <= 799); }

std::size_t networkDigits(unsigned country) {
  if (!isCountry(country)) return 0;
  const bool threeDigits = std::ranges::any_of(
      kThreeDigitNetworks,
      [country](const Countries& row) { return row.first <= country && country <= row.last; });
  return threeDigits ? 6 : 5;
}

}  // namespace

std::uint8_t ImsiLayout::digitAt(ByteView bytes, std::size_t index) const {
  return halfAt(bytes, firstHalf + index);
}

void ImsiLayout::setDigit(Bytes& bytes, std::size_t index, std::uint8_t digit) const {
  const std::size_t half = firstHalf + index;
  std::uint8_t& byte = bytes[half / 2];
  byte = static_cast<std::uint8_t>(half % 2 == 0 ? (byte & 0xF0) | digit
                                                 : (byte & 0x0F) | (digit << 4));
}

std::optional<ImsiLayout> imsiLayout(ByteView bytes) {
  ImsiLayout layout{firstDigit(bytes), 0, 0};
  std::size_t end = bytes.size() * 2;
  while (end > layout.firstHalf && halfAt(bytes, end - 1) == kFiller) --end;
  layout.digits = end - std::min(end, layout.firstHalf);
  if (layout.digits < kFewestDigits || layout.digits > kMostDigits) return std::nullopt;
  for (std::size_t i = 0; i < layout.digits; ++i) {
    if (layout.digitAt(bytes, i) > 9) return std::nullopt;
  }
  const unsigned country =
      layout.digitAt(bytes, 0) * 100U + layout.digitAt(bytes, 1) * 10U + layout.digitAt(bytes, 2);
  layout.networkDigits = networkDigits(country);
  return layout;
}

}  // namespace qel
