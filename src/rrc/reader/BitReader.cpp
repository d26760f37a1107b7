#include "rrc/reader/BitReader.h"

#include <bit>

namespace qel::rrc {

std::uint64_t BitReader::bits(unsigned count) {
  if (_failed || count > 64 || count > left()) {
    _failed = true;
    return 0;
  }
  std::uint64_t value = 0;
  while (count > 0) {
    const auto offset = static_cast<unsigned>(_position % 8);
    const unsigned taken = count < 8 - offset ? count : 8 - offset;
    const unsigned shifted = unsigned{_bytes[_position / 8]} >> (8 - offset - taken);
    value = value << taken | (shifted & ((1U << taken) - 1));
    _position += taken;
    count -= taken;
  }
  return value;
}

void BitReader::skip(std::size_t count) {
  if (_failed || count > left()) {
    _failed = true;
  } else {
    _position += count;
  }
}

std::int64_t BitReader::integer(std::int64_t low, std::int64_t high) {
  const auto range = static_cast<std::uint64_t>(high) - static_cast<std::uint64_t>(low);
  const std::uint64_t above = bits(static_cast<unsigned>(std::bit_width(range)));
  if (above > range) _failed = true;
  return _failed ? low : static_cast<std::int64_t>(static_cast<std::uint64_t>(low) + above);
}

std::size_t BitReader::length() {
  if (!flag()) return static_cast<std::size_t>(bits(7));
  if (!flag()) return static_cast<std::size_t>(bits(14));
  _failed = true;
  return 0;
}

std::uint64_t BitReader::smallNumber() {
  if (!flag()) return bits(6);
  const std::size_t octets = length();
  if (octets < 1 || octets > 8) {
    _failed = true;
    return 0;
  }
  return bits(static_cast<unsigned>(octets) * 8);
}

std::size_t BitReader::smallLength() {
  if (!flag()) return static_cast<std::size_t>(bits(6)) + 1;
  const std::size_t count = length();
  if (count < 1) _failed = true;
  return count;
}

BitReader BitReader::part(std::size_t count) {
  BitReader part = *this;
  skip(count);
  if (_failed) {
    part._failed = true;
  } else {
    part._end = _position;
  }
  return part;
}

}  // namespace qel::rrc
