#include "messages/runtime/PBDataWriter.h"

#include <array>

#include "messages/runtime/PBCodable.h"

namespace qel {
namespace {

enum class Wire : std::uint8_t { varint = 0, delimited = 2 };

// The bytes of a varint, at most ten.
struct Varint {
  explicit Varint(std::uint64_t value) {
    while (value >= 0x80) {
      bytes[size++] = static_cast<std::uint8_t>(value | 0x80);
      value >>= 7;
    }
    bytes[size++] = static_cast<std::uint8_t>(value);
  }
  auto begin() const { return bytes.begin(); }
  auto end() const { return bytes.begin() + size; }

  std::array<std::uint8_t, 10> bytes;
  std::uint8_t size = 0;
};

void append(PBDataWriter& writer, const Varint& varint) {
  writer._output.insert(writer._output.end(), varint.begin(), varint.end());
}

void appendTag(PBDataWriter& writer, std::uint32_t field, Wire wire) {
  if (field == kPBNoTag) return;
  append(writer, Varint(std::uint64_t{field} << 3 | static_cast<std::uint64_t>(wire)));
}

}  // namespace

void PBDataWriterWriteUint64Field(PBDataWriter& writer, std::uint64_t value, std::uint32_t field) {
  appendTag(writer, field, Wire::varint);
  append(writer, Varint(value));
}

void PBDataWriterWriteUint32Field(PBDataWriter& writer, std::uint32_t value, std::uint32_t field) {
  PBDataWriterWriteUint64Field(writer, value, field);
}

void PBDataWriterWriteInt32Field(PBDataWriter& writer, std::int32_t value, std::uint32_t field) {
  PBDataWriterWriteUint64Field(writer, static_cast<std::uint64_t>(std::int64_t{value}), field);
}

void PBDataWriterWriteSint32Field(PBDataWriter& writer, std::int32_t value, std::uint32_t field) {
  const std::uint32_t zigzag =
      static_cast<std::uint32_t>(value) << 1 ^ (value < 0 ? 0xFFFFFFFFU : 0U);
  PBDataWriterWriteUint64Field(writer, zigzag, field);
}

void PBDataWriterWriteBOOLField(PBDataWriter& writer, bool value, std::uint32_t field) {
  PBDataWriterWriteUint64Field(writer, value ? 1 : 0, field);
}

void PBDataWriterWriteDataField(PBDataWriter& writer, ByteView value, std::uint32_t field) {
  appendTag(writer, field, Wire::delimited);
  append(writer, Varint(value.size()));
  writer._output.insert(writer._output.end(), value.begin(), value.end());
}

void PBDataWriterWriteStringField(PBDataWriter& writer, std::string_view value,
                                  std::uint32_t field) {
  const auto* bytes = reinterpret_cast<const std::uint8_t*>(value.data());
  PBDataWriterWriteDataField(writer, {bytes, value.size()}, field);
}

void PBDataWriterWriteSubmessage(PBDataWriter& writer, const PBCodable& message,
                                 std::uint32_t field) {
  PBDataWriterMark mark;
  PBDataWriterPlaceMark(writer, mark, field);
  message.writeTo(writer);
  PBDataWriterRecallMark(writer, mark);
}

void PBDataWriterPlaceMark(PBDataWriter& writer, PBDataWriterMark& mark, std::uint32_t field) {
  appendTag(writer, field, Wire::delimited);
  mark.start = writer._output.size();
}

void PBDataWriterRecallMark(PBDataWriter& writer, const PBDataWriterMark& mark) {
  const Varint length(writer._output.size() - mark.start);
  writer._output.insert(writer._output.begin() + static_cast<std::ptrdiff_t>(mark.start),
                        length.begin(), length.end());
}

}  // namespace qel
