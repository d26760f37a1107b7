#include "sources/simulated/Bcd.h"

#include <string>

#include "radio/Networks.h"

namespace qel::sources {
namespace {

constexpr std::uint32_t kFiller = 0xF;

std::uint32_t digitAt(std::string_view digits, std::size_t index) {
  return index < digits.size() ? static_cast<std::uint32_t>(digits[index] - '0') : kFiller;
}

std::uint8_t pair(std::uint32_t low, std::uint32_t high) {
  return static_cast<std::uint8_t>(high << 4 | low);
}

}  // namespace

Bytes swappedDigits(std::string_view digits) {
  Bytes out;
  for (std::size_t i = 0; i < digits.size(); i += 2) {
    out.push_back(pair(digitAt(digits, i), digitAt(digits, i + 1)));
  }
  return out;
}

Bytes encodedImsi(std::string_view digits) {
  constexpr std::uint32_t kTypeImsi = 1;
  constexpr std::uint32_t kOdd = 8;
  const std::uint32_t type = kTypeImsi | (digits.size() % 2 == 1 ? kOdd : 0);
  Bytes out = {0, pair(type, digitAt(digits, 0))};
  const Bytes rest = swappedDigits(digits.substr(1));
  out.insert(out.end(), rest.begin(), rest.end());
  out[0] = static_cast<std::uint8_t>(out.size() - 1);
  return out;
}

Bytes encodedPlmn(std::uint32_t mcc, std::uint32_t mnc, std::uint32_t mncDigits) {
  const auto network = networkOf(mcc, mnc, mncDigits);
  return network ? bytesOf(*network).value_or(Bytes()) : Bytes();
}

}  // namespace qel::sources
