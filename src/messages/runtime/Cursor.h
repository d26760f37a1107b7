// Where reading stands in a run of bytes, in registers.
#pragma once

#include <cstddef>
#include <cstdint>

namespace qel {

// The place in damaged bytes: behind every end, so that nothing more is read there.
inline const std::uint8_t* const kDamaged =
    reinterpret_cast<const std::uint8_t*>(~std::uintptr_t{0});

// The place of the next byte and the end of what may be read. Two words, passed and returned by
// value, so that the compiler keeps them in registers all through a message.
struct Cursor {
  const std::uint8_t* at;
  const std::uint8_t* end;

  static Cursor damaged() { return {kDamaged, kDamaged}; }
  bool isDamaged() const { return at == kDamaged; }
  // Nothing more to read: at the end, or damaged.
  bool isAtEnd() const { return at >= end; }
  std::size_t left() const { return static_cast<std::size_t>(end - at); }
};

// A varint and the place behind it; kDamaged when it ran past the end, and the value is then 0.
struct Varint {
  std::uint64_t value;
  const std::uint8_t* next;
};

// Varints of any length. At most ten bytes are one; ten that all carry the top bit read as 0.
Varint readLongVarint(const std::uint8_t* at, const std::uint8_t* end);

// The same where at least one byte is left, with the lengths that nearly all varints have taken on
// the spot.
[[gnu::always_inline]] inline Varint readVarintHere(Cursor cursor) {
  const std::uint64_t first = cursor.at[0];
  if (first < 0x80) return {first, cursor.at + 1};
  if (cursor.at + 1 < cursor.end) [[likely]] {
    const std::uint64_t second = cursor.at[1];
    if (second < 0x80) return {(first & 0x7F) | second << 7, cursor.at + 2};
  }
  return readLongVarint(cursor.at, cursor.end);
}

[[gnu::always_inline]] inline Varint readVarint(Cursor cursor) {
  if (cursor.isAtEnd()) [[unlikely]]
    return {0, kDamaged};
  return readVarintHere(cursor);
}

// The part of the input that a varint length in front of it gives; damaged when it is not all
// there.
[[gnu::always_inline]] inline Cursor readDelimited(Cursor cursor) {
  const auto [length, next] = readVarint(cursor);
  if (next > cursor.end || length > static_cast<std::uint64_t>(cursor.end - next)) {
    return Cursor::damaged();
  }
  return {next, next + length};
}

// Goes past one value by its wire type: a varint, eight bytes, what is delimited, or four bytes.
// Damaged on any other, groups too, and past the end.
Cursor skipScalar(Cursor cursor, std::uint8_t wireType);

}  // namespace qel
