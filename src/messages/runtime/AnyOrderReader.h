// Reading fields in whatever order they come.
#pragma once

#include <cstdint>
#include <tuple>
#include <utility>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/runtime/FieldOrder.h"

namespace qel {

// Logs "Unknown tag: %x:%u".
void logUnknownTag(std::uint32_t fieldNumber, std::uint32_t value);

// Skips the value of a field that the message does not have.
Cursor skipUnknown(Cursor cursor, std::uint32_t fieldNumber, std::uint8_t wireType);

// Gives the value of the field with this number to the target, or skips it when the message has no
// such field.
template <class Message, class Target, std::size_t... index>
Cursor readNumbered(Target& target, Cursor cursor, std::uint32_t number, std::uint8_t wireType,
                    std::index_sequence<index...>) {
  Cursor next = cursor;
  const bool known =
      ((number == std::get<index>(kFieldsOf<Message>).number &&
        (next = target.template take<index>(cursor, std::get<index>(kFieldsOf<Message>)), true)) ||
       ...);
  return known ? next : skipUnknown(cursor, number, wireType);
}

// Goes through the bytes and gives what each field has to the target, which has
//   Cursor take<index>(Cursor, field)  reads the value that stands here
// Where reading stopped, damaged if the bytes are.
template <class Message, class Target>
Cursor readInAnyOrder(Target& target, Cursor cursor) {
  constexpr std::uint8_t kEndOfGroup = 4;
  using Fields = std::make_index_sequence<std::tuple_size_v<FieldsOf<Message>>>;
  while (!cursor.isAtEnd()) {
    const auto [tag, next] = readVarint(cursor);
    cursor.at = next;
    const auto wireType = static_cast<std::uint8_t>(tag & 7);
    if (cursor.isDamaged() || wireType == kEndOfGroup) break;
    const auto number = static_cast<std::uint32_t>(tag >> 3 & 0xFFFF);
    if (KBBMetricUtility::isValidMetricIdTag(number, Message::kClassName)) {
      // A metric identifier in place of a field: its varint is taken and logged, never stored.
      const auto [value, behind] = readVarint(cursor);
      logUnknownTag(number, decodedScalar<Encoding::uint32>(value));
      cursor.at = behind;
    } else {
      cursor = readNumbered<Message>(target, cursor, number, wireType, Fields());
    }
  }
  return cursor;
}

}  // namespace qel
