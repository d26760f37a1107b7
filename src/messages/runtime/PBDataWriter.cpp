#include "messages/runtime/PBDataWriter.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <utility>

#include "messages/runtime/PBCodable.h"

namespace qel {
namespace {

constexpr std::uint32_t kDelimited = 2;

}  // namespace

void PBDataWriter::grow(std::size_t count) {
  constexpr std::size_t kSmallest = 128;
  const std::size_t used = size();
  _output.resize(std::max({kSmallest, 2 * _output.size(), used + count}));
  _at = _output.data() + used;
  _end = _output.data() + _output.size();
}

Bytes PBDataWriter::takeData() {
  _output.resize(size());
  _at = _end = nullptr;
  return std::exchange(_output, {});
}

void PBDataWriterWriteDataField(PBDataWriter& writer, ByteView value, std::uint32_t field) {
  PBDataWriterWriteVarint(writer, value.size(), field, kDelimited);
  writer.writtenTo(std::ranges::copy(value, writer.room(value.size())).out);
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
  // No mark of this writer: there is a length in front of every one.
  if (mark.start == 0 || mark.start > writer.size()) return;
  const std::size_t size = writer.size() - mark.start;
  std::array<std::uint8_t, kLongestVarint> length;
  const auto lengthSize =
      static_cast<std::size_t>(PBPutVarint(length.data(), size) - length.data());
  std::uint8_t* content = writer.room(lengthSize) - size;
  if (lengthSize > 1) std::memmove(content + lengthSize - 1, content, size);
  std::copy_n(length.data(), lengthSize, content - 1);
  writer.writtenTo(content + size + lengthSize - 1);
}

}  // namespace qel
