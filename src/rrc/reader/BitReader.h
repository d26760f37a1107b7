// Takes bits off the front of bytes, and the lengths of the unaligned packed encoding (X.691).
#pragma once

#include <cstddef>
#include <cstdint>

#include "base/Bytes.h"

namespace qel::rrc {

// Past the end everything is zero and `failed` says so. The bytes belong to the caller.
class BitReader {
 public:
  explicit BitReader(ByteView bytes) : _bytes(bytes), _end(bytes.size() * 8) {}

  std::uint64_t bits(unsigned count);  // 64 at most
  bool flag() { return bits(1) != 0; }
  void skip(std::size_t count);

  // A number of `low` to `high`; fails when the bits say one that is greater.
  std::int64_t integer(std::int64_t low, std::int64_t high);

  // A length without bounds. Fails at 16,384 and more, which would come in fragments.
  std::size_t length();
  // A number that is most often below 64.
  std::uint64_t smallNumber();
  // How many additions follow: at least one.
  std::size_t smallLength();

  // The next `count` bits as a reader of their own, which begins with this one's position; this one
  // goes on behind them.
  BitReader part(std::size_t count);

  bool failed() const { return _failed; }
  void fail() { _failed = true; }
  std::size_t position() const { return _position; }  // in bits from the front of the bytes
  std::size_t left() const { return _end - _position; }

 private:
  ByteView _bytes;
  std::size_t _position = 0;
  std::size_t _end;
  bool _failed = false;
};

}  // namespace qel::rrc
