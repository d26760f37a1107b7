#include "radio/Networks.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "radio/Digits.h"

namespace qel {
namespace {

constexpr std::uint32_t kHighestCode = 999;
constexpr std::size_t kPlmnBytes = 3;

bool hasThreeDigitsAlways(std::uint32_t mcc) {
  constexpr std::uint32_t kFirstOfUnitedStates = 310;
  constexpr std::uint32_t kLastOfUnitedStates = 316;
  constexpr std::array<std::uint32_t, 2> kCanadaAndMexico = {302, 334};
  return (mcc >= kFirstOfUnitedStates && mcc <= kLastOfUnitedStates) ||
         std::ranges::count(kCanadaAndMexico, mcc) != 0;
}

std::string padded(std::uint32_t number, std::size_t digits) {
  const std::string text = std::to_string(number);
  return std::string(digits - std::min(digits, text.size()), '0') + text;
}

bool areDigits(std::string_view text) {
  return std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
}

}  // namespace

std::optional<Network> networkOf(std::uint32_t mcc, std::uint32_t mnc,
                                 std::optional<std::uint32_t> mncDigits) {
  if (mcc > kHighestCode || mnc > kHighestCode) return std::nullopt;
  const bool three = mnc > 99 || (mncDigits == 2U || mncDigits == 3U ? *mncDigits == 3U
                                                                     : hasThreeDigitsAlways(mcc));
  return Network{padded(mcc, 3), padded(mnc, three ? 3 : 2)};
}

// The bytes hold mcc 1, 2; mcc 3 and mnc 3; mnc 1, 2, the first digit of each in the low half.
std::optional<Network> networkOfBytes(ByteView bytes) {
  if (bytes.size() != kPlmnBytes) return std::nullopt;
  const std::string digits = swappedDigits(bytes);
  Network network{digits.substr(0, 3), digits.substr(4, 2)};
  if (digits[3] != kFillerDigit) network.mnc += digits[3];
  if (!areDigits(network.mcc) || !areDigits(network.mnc)) return std::nullopt;
  return network;
}

std::optional<Bytes> bytesOf(const Network& network) {
  const auto& [mcc, mnc] = network;
  const bool whole = mcc.size() == 3 && (mnc.size() == 2 || mnc.size() == 3);
  if (!whole || !areDigits(mcc) || !areDigits(mnc)) return std::nullopt;
  const auto pair = [](char low, char high) {
    return static_cast<std::uint8_t>((high - '0') << 4 | (low - '0'));
  };
  constexpr std::uint8_t kFiller = 0xF0;
  const auto third = static_cast<std::uint8_t>(mnc.size() == 3 ? (mnc[2] - '0') << 4 : kFiller);
  return Bytes{pair(mcc[0], mcc[1]), static_cast<std::uint8_t>(third | (mcc[2] - '0')),
               pair(mnc[0], mnc[1])};
}

}  // namespace qel
