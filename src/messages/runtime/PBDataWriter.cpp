#include "messages/runtime/PBDataWriter.h"

#include <algorithm>
#include <array>
#include <cstring>

#include "messages/runtime/PBCodable.h"

namespace qel {
namespace {

constexpr std::uint32_t kDelimited = 2;

}  // namespace

void PBDataWriter::grow(std::size_t count) {
  constexpr std::size_t kSmallest = 128;
  _output.resize(std::max({kSmallest, 2 * _output.size(), _size + count}));
}

void PBDataWriterWriteDataField(PBDataWriter& writer, ByteView value, std::uint32_t field) {
  PBDataWriterWriteVarint(writer, value.size(), field, kDelimited);
  std::ranges::copy(value, writer.room(value.size()));
  writer.written(value.size());
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

// One byte is kept for the length, which is all that most need.
void PBDataWriterPlaceMark(PBDataWriter& writer, PBDataWriterMark& mark, std::uint32_t field) {
  PBDataWriterWriteVarint(writer, 0, field, kDelimited);
  mark.start = writer.size();
}

void PBDataWriterRecallMark(PBDataWriter& writer, const PBDataWriterMark& mark) {
  const std::size_t size = writer.size() - mark.start;
  std::array<std::uint8_t, kLongestVarint> length;
  const std::size_t lengthSize = PBPutVarint(length.data(), size);
  std::uint8_t* content = writer.room(lengthSize) - size;
  if (lengthSize > 1) std::memmove(content + lengthSize - 1, content, size);
  std::copy_n(length.data(), lengthSize, content - 1);
  writer.written(lengthSize - 1);
}

}  // namespace qel
