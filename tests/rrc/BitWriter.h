// Writes the unaligned packed encoding, for tests; it shares nothing with what reads it.
#pragma once

#include <cstdint>
#include <vector>

#include "base/Bytes.h"

namespace qel::testing {

class BitWriter {
 public:
  BitWriter& bits(std::uint64_t value, unsigned count) {
    for (unsigned i = count; i > 0; --i) _bits.push_back(((value >> (i - 1)) & 1U) != 0);
    return *this;
  }
  BitWriter& flag(bool value) { return bits(value ? 1 : 0, 1); }

  // A number between two others, in as few bits as all of them need.
  BitWriter& number(std::int64_t value, std::int64_t low, std::int64_t high) {
    const auto most = static_cast<std::uint64_t>(high - low);
    unsigned count = 0;
    while (count < 64 && (most >> count) != 0) ++count;
    return bits(static_cast<std::uint64_t>(value - low), count);
  }

  // A length without bounds: below 128 in 8 bits, below 16,384 in 16.
  BitWriter& length(std::size_t value) {
    return value < 128 ? bits(value, 8) : bits(0x8000 | value, 16);
  }
  BitWriter& smallNumber(std::size_t value) {
    return value < 64 ? bits(value, 7) : bits(1, 1).length(1).bits(value, 8);
  }

  BitWriter& octets(ByteView bytes) {
    for (const std::uint8_t byte : bytes) bits(byte, 8);
    return *this;
  }
  BitWriter& append(const BitWriter& other) {
    _bits.insert(_bits.end(), other._bits.begin(), other._bits.end());
    return *this;
  }
  // What was written elsewhere, filled up to whole bytes, at least one, with their number in front.
  BitWriter& contained(const BitWriter& other) {
    const Bytes inside = other.size() > 0 ? other.bytes() : Bytes(1);
    return length(inside.size()).octets(inside);
  }

  std::size_t size() const { return _bits.size(); }

  // The last byte is filled up with zeros.
  Bytes bytes() const {
    Bytes bytes((_bits.size() + 7) / 8);
    for (std::size_t i = 0; i < _bits.size(); ++i) {
      if (_bits[i]) bytes[i / 8] = static_cast<std::uint8_t>(bytes[i / 8] | (0x80U >> (i % 8)));
    }
    return bytes;
  }

 private:
  std::vector<bool> _bits;
};

}  // namespace qel::testing
