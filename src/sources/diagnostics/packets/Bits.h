// Numbers out of the modem's memory: little-endian, packed into words.
#pragma once

#include <cstddef>
#include <cstdint>

#include "base/Bytes.h"

namespace qel::diagnostics {

// The caller has seen that the bytes are there.
inline std::uint32_t u16At(ByteView bytes, std::size_t offset) {
  return static_cast<std::uint32_t>(bytes[offset]) | static_cast<std::uint32_t>(bytes[offset + 1])
                                                         << 8;
}

inline std::uint32_t u32At(ByteView bytes, std::size_t offset) {
  return u16At(bytes, offset) | u16At(bytes, offset + 2) << 16;
}

inline std::uint64_t u64At(ByteView bytes, std::size_t offset) {
  return u32At(bytes, offset) | std::uint64_t{u32At(bytes, offset + 4)} << 32;
}

inline std::int32_t s16At(ByteView bytes, std::size_t offset) {
  return static_cast<std::int16_t>(u16At(bytes, offset));
}

// `count` bits, 1 to 31, of a word from the lowest `first` on.
constexpr std::uint32_t bits(std::uint32_t word, unsigned first, unsigned count) {
  return word >> first & ((1U << count) - 1U);
}

// Likewise, with the highest of them as a sign.
constexpr std::int32_t signedBits(std::uint32_t word, unsigned first, unsigned count) {
  const std::uint32_t sign = 1U << (count - 1U);
  return static_cast<std::int32_t>(bits(word, first, count) ^ sign) -
         static_cast<std::int32_t>(sign);
}

}  // namespace qel::diagnostics
