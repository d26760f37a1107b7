// Writes protocol-buffer wire format.
#pragma once

#include <cstdint>
#include <string_view>
#include <utility>

#include "base/Bytes.h"

namespace qel {

class PBCodable;

// Collects what is written. The buffer keeps its size over clear, so that a writer that is used
// again allocates nothing.
class PBDataWriter {
 public:
  PBDataWriter() = default;
  PBDataWriter(const PBDataWriter&) = delete;
  PBDataWriter& operator=(const PBDataWriter&) = delete;

  // What is written. Valid until more is.
  ByteView data() const { return {_output.data(), size()}; }
  Bytes takeData();
  void clear() { _at = _output.data(); }

  std::size_t size() const { return static_cast<std::size_t>(_at - _output.data()); }
  // The next `count` bytes of the buffer, for writing; writtenTo says where what is filled ends.
  std::uint8_t* room(std::size_t count) {
    if (static_cast<std::size_t>(_end - _at) < count) [[unlikely]]
      grow(count);
    return _at;
  }
  void writtenTo(std::uint8_t* end) { _at = end; }

 private:
  void grow(std::size_t count);

  Bytes _output;
  std::uint8_t* _at = nullptr;   // in _output, behind what is written
  std::uint8_t* _end = nullptr;  // of _output
};

// What PBDataWriterPlaceMark remembers: where the marked content starts.
struct PBDataWriterMark {
  std::size_t start = 0;
};

// As a field number: write the value only, without a tag.
inline constexpr std::uint32_t kPBNoTag = 0xFFFFFFFF;

// The longest varint has ten bytes.
inline constexpr std::size_t kLongestVarint = 10;

// Fills in the varint at this place; the place behind it. Nearly all take one or two bytes.
[[gnu::always_inline]] inline std::uint8_t* PBPutVarint(std::uint8_t* at, std::uint64_t value) {
  if (value < 0x80) [[likely]] {
    *at = static_cast<std::uint8_t>(value);
    return at + 1;
  }
  if (value < 0x4000) {
    at[0] = static_cast<std::uint8_t>(value | 0x80);
    at[1] = static_cast<std::uint8_t>(value >> 7);
    return at + 2;
  }
  while (value >= 0x80) {
    *at++ = static_cast<std::uint8_t>(value | 0x80);
    value >>= 7;
  }
  *at++ = static_cast<std::uint8_t>(value);
  return at;
}

inline std::uint32_t PBZigZag(std::int32_t value) {
  const std::uint32_t sign = value < 0 ? 0xFFFFFFFFU : 0U;
  return static_cast<std::uint32_t>(value) << 1 ^ sign;
}

// A field that is a varint, or the tag and length of one that is delimited.
inline void PBDataWriterWriteVarint(PBDataWriter& writer, std::uint64_t value, std::uint32_t field,
                                    std::uint32_t wireType) {
  std::uint8_t* at = writer.room(2 * kLongestVarint);
  if (field != kPBNoTag) at = PBPutVarint(at, std::uint64_t{field} << 3 | wireType);
  writer.writtenTo(PBPutVarint(at, value));
}

// Each appends one field. Integers are varints; a negative int32 takes ten bytes.
inline void PBDataWriterWriteUint64Field(PBDataWriter& writer, std::uint64_t value,
                                         std::uint32_t field) {
  PBDataWriterWriteVarint(writer, value, field, 0);
}
inline void PBDataWriterWriteUint32Field(PBDataWriter& writer, std::uint32_t value,
                                         std::uint32_t field) {
  PBDataWriterWriteVarint(writer, value, field, 0);
}
inline void PBDataWriterWriteInt32Field(PBDataWriter& writer, std::int32_t value,
                                        std::uint32_t field) {
  PBDataWriterWriteVarint(writer, static_cast<std::uint64_t>(std::int64_t{value}), field, 0);
}
inline void PBDataWriterWriteSint32Field(PBDataWriter& writer, std::int32_t value,
                                         std::uint32_t field) {
  PBDataWriterWriteVarint(writer, PBZigZag(value), field, 0);
}
inline void PBDataWriterWriteBOOLField(PBDataWriter& writer, bool value, std::uint32_t field) {
  PBDataWriterWriteVarint(writer, value ? 1 : 0, field, 0);
}
void PBDataWriterWriteDataField(PBDataWriter& writer, ByteView value, std::uint32_t field);
void PBDataWriterWriteStringField(PBDataWriter& writer, std::string_view value,
                                  std::uint32_t field);
void PBDataWriterWriteSubmessage(PBDataWriter& writer, const PBCodable& message,
                                 std::uint32_t field);

// Opens a length-delimited field; the matching recall fills in the length of all that was written
// in between, in as few bytes as it needs. Marks nest. Recalling a mark that was never placed, or
// one behind what is written, does nothing.
void PBDataWriterPlaceMark(PBDataWriter& writer, PBDataWriterMark& mark, std::uint32_t field);
void PBDataWriterRecallMark(PBDataWriter& writer, const PBDataWriterMark& mark);

}  // namespace qel
