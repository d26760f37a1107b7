#include "recording/PlainScanner.h"

namespace qel {
namespace {

constexpr std::size_t kWord = sizeof(std::uint64_t);
constexpr std::uint64_t kEach = 0x0101010101010101;  // of the eight characters of a word

// Eight characters, the first of them in the lowest bits.
std::uint64_t wordAt(const char* text) {
  std::uint64_t word = 0;
  for (std::size_t i = 0; i < kWord; ++i) {
    word |= std::uint64_t{static_cast<unsigned char>(text[i])} << 8 * i;
  }
  return word;
}

// How many digits stand at the front of a word from which '0' was taken bit by bit: in a digit's
// place is less than 10 then. A sum that carries spoils only what comes after the first other
// character.
std::size_t digitsIn(std::uint64_t values) {
  const std::uint64_t others = (values | (values + 6 * kEach)) & 0xF0 * kEach;
  return static_cast<std::size_t>(std::countr_zero(others)) / 8;
}

// Of eight digits: neighbours become one number, of two, of four, of eight digits.
std::uint64_t numberOf(std::uint64_t values) {
  values = (values * 10 + (values >> 8)) & 0x00FF00FF00FF00FF;
  values = (values * 100 + (values >> 16)) & 0x0000FFFF0000FFFF;
  return (values * 10000 + (values >> 32)) & 0xFFFFFFFF;
}

constexpr std::array<std::uint64_t, kWord + 1> kPowersOfTen = {
    1, 10, 100, 1000, 10'000, 100'000, 1'000'000, 10'000'000, 100'000'000};

}  // namespace

std::optional<std::uint64_t> PlainScanner::number() {
  constexpr std::size_t kMostDigits = 18;
  skipBlanks();
  const char* const start = _next;
  std::uint64_t number = 0;
  std::size_t digits = kWord;
  while (digits == kWord && left() >= kWord) {
    const std::uint64_t values = wordAt(_next) ^ '0' * kEach;
    digits = digitsIn(values);
    if (digits == 0) break;
    number = number * kPowersOfTen[digits] + numberOf(values << 8 * (kWord - digits));
    _next += digits;
  }
  if (digits == kWord) {
    for (; _next != _end && *_next >= '0' && *_next <= '9'; ++_next) {
      number = number * 10 + static_cast<std::uint64_t>(*_next - '0');
    }
  }
  const auto size = static_cast<std::size_t>(_next - start);
  if (size == 0 || size > kMostDigits || (size > 1 && *start == '0')) return std::nullopt;
  return number;
}

}  // namespace qel
