// Where the digits of an IMSI stand in its bytes.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace qel {

// Digits two a byte, the first in the low half.
struct ImsiLayout {
  std::size_t firstHalf;      // the half byte of the first digit
  std::size_t digits;         // in all
  std::size_t networkDigits;  // of those, the first that name country and network; may be 0

  std::uint8_t digitAt(ByteView bytes, std::size_t index) const;
  void setDigit(Bytes& bytes, std::size_t index, std::uint8_t digit) const;
};

// Knows digits alone, behind a type (24.008, clause 10.5.1.4), and behind a length and a type
// (31.102, clause 4.2.2). Nothing for bytes that are neither. The network's digits are counted only
// when the country code is one.
std::optional<ImsiLayout> imsiLayout(ByteView bytes);

}  // namespace qel
