// The end of GSM's broadcast messages: bits in the notation of 24.007, annex B.
#pragma once

#include <cstddef>
#include <cstdint>

#include "base/Bytes.h"

namespace qel::diagnostics {

// Bits from the highest of the first octet on. A bit told as L or H is one by comparison with the
// padding pattern 0010 1011; behind the end all of these are L. A number that is cut off leaves
// the reader failed, and all after it is 0.
class RestOctets {
 public:
  explicit RestOctets(ByteView octets) : _octets(octets) {}

  bool high();
  std::uint32_t bits(std::size_t count);  // at most 32
  bool bit() { return bits(1) != 0; }
  void skip(std::size_t count);

  std::size_t position() const { return _position; }
  bool failed() const { return _failed; }

 private:
  bool raw(std::size_t position) const {
    return (_octets[position / 8] >> (7 - position % 8) & 1) != 0;
  }

  ByteView _octets;
  std::size_t _position = 0;
  bool _failed = false;
};

}  // namespace qel::diagnostics
