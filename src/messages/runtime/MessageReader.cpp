#include "messages/runtime/MessageReader.h"

#include <array>
#include <cstdio>

#include "messages/catalogue/TagLog.h"
#include "messages/runtime/PBDataReader.h"

namespace qel {

void logUnknownTag(std::uint32_t fieldNumber, std::uint32_t value) {
  std::array<char, 48> line;
  const int length =
      std::snprintf(line.data(), line.size(), "Unknown tag: %x:%u", fieldNumber, value);
  writeTagLine({line.data(), static_cast<std::size_t>(length)});
}

Cursor skipUnknown(Cursor cursor, std::uint32_t fieldNumber, std::uint8_t wireType) {
  PBDataReader reader({cursor.at, cursor.left()});
  if (!PBReaderSkipValueWithTag(reader, fieldNumber, wireType)) return Cursor::damaged();
  return {cursor.at + reader._pos, cursor.end};
}

}  // namespace qel
