// Writes protocol-buffer wire format.
#pragma once

#include <cstdint>
#include <string_view>

#include "base/Bytes.h"

namespace qel {

class PBCodable;

// Collects what is written; the buffer grows as needed.
class PBDataWriter {
 public:
  const Bytes& data() const { return _output; }
  Bytes takeData() { return std::move(_output); }

  Bytes _output;
};

// What PBDataWriterPlaceMark remembers: where the marked content starts.
struct PBDataWriterMark {
  std::size_t start = 0;
};

// As a field number: write the value only, without a tag.
inline constexpr std::uint32_t kPBNoTag = 0xFFFFFFFF;

// Each appends one field. Integers are varints; a negative int32 takes ten bytes.
void PBDataWriterWriteUint64Field(PBDataWriter& writer, std::uint64_t value, std::uint32_t field);
void PBDataWriterWriteUint32Field(PBDataWriter& writer, std::uint32_t value, std::uint32_t field);
void PBDataWriterWriteInt32Field(PBDataWriter& writer, std::int32_t value, std::uint32_t field);
void PBDataWriterWriteSint32Field(PBDataWriter& writer, std::int32_t value, std::uint32_t field);
void PBDataWriterWriteBOOLField(PBDataWriter& writer, bool value, std::uint32_t field);
void PBDataWriterWriteDataField(PBDataWriter& writer, ByteView value, std::uint32_t field);
void PBDataWriterWriteStringField(PBDataWriter& writer, std::string_view value,
                                  std::uint32_t field);
void PBDataWriterWriteSubmessage(PBDataWriter& writer, const PBCodable& message,
                                 std::uint32_t field);

// Opens a length-delimited field; the matching recall fills in the length of all that was written
// in between, in as few bytes as it needs. Marks nest.
void PBDataWriterPlaceMark(PBDataWriter& writer, PBDataWriterMark& mark, std::uint32_t field);
void PBDataWriterRecallMark(PBDataWriter& writer, const PBDataWriterMark& mark);

}  // namespace qel
