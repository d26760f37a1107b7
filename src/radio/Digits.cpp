#include "radio/Digits.h"

#include <algorithm>

namespace qel {

std::string swappedDigits(ByteView bytes) {
  constexpr std::string_view kDigits = "0123456789abcdef";
  std::string digits;
  digits.reserve(2 * bytes.size());
  for (const std::uint8_t byte : bytes) {
    digits += kDigits[byte & 0x0F];
    digits += kDigits[byte >> 4];
  }
  return digits;
}

std::optional<std::string> packedDigits(ByteView bytes) {
  std::string digits = swappedDigits(bytes);
  digits.erase(
      std::find_if(digits.rbegin(), digits.rend(), [](char c) { return c != kFillerDigit; }).base(),
      digits.end());
  const bool plain = std::ranges::all_of(digits, [](char c) { return c >= '0' && c <= '9'; });
  if (!plain || digits.empty()) return std::nullopt;
  return digits;
}

std::optional<std::string> mobileIdentity(ByteView bytes) {
  constexpr std::size_t kBytes = 8;  // of fifteen digits
  constexpr std::size_t kMostBytes = 9;
  if (!bytes.empty() && bytes[0] == bytes.size() - 1) bytes = bytes.subspan(1);
  if (bytes.size() != kBytes && bytes.size() != kMostBytes) return std::nullopt;
  // The lowest three bits: 1 an IMSI, 2 an IMEI, 3 an IMEISV.
  const unsigned type = bytes[0] & 0x07U;
  if (type == 0 || type > 3) return std::nullopt;
  const std::string halves = swappedDigits(bytes).substr(1);
  const auto end = halves.find_first_not_of("0123456789");
  constexpr std::size_t kFewest = 6;
  const bool filledUp = halves.find_first_not_of(kFillerDigit, end) == std::string::npos;
  if (end != std::string::npos && (!filledUp || end < kFewest)) return std::nullopt;
  return halves.substr(0, end);
}

}  // namespace qel
