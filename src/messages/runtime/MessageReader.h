// The reading rules of every message class.
#pragma once

#include <array>
#include <charconv>
#include <memory>
#include <string>

#include "base/LogSink.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/runtime/Fields.h"
#include "messages/runtime/PBDataReader.h"
#include "messages/runtime/Presence.h"

namespace qel {

// Logs "Unknown tag: %x:%u".
void logUnknownTag(std::uint32_t fieldNumber, std::uint32_t value);

template <class Message>
bool readMessage(Message& message, PBDataReader& reader);

// The value that a varint on the wire stands for.
template <Encoding encoding>
auto decodedScalar(std::uint64_t varint) {
  const auto low = static_cast<std::uint32_t>(varint);
  if constexpr (encoding == Encoding::uint64) return varint;
  if constexpr (encoding == Encoding::uint32) return low;
  if constexpr (encoding == Encoding::int32) return static_cast<std::int32_t>(low);
  if constexpr (encoding == Encoding::sint32) {
    return static_cast<std::int32_t>(low >> 1 ^ (0U - (low & 1)));
  }
  if constexpr (encoding == Encoding::boolean) return varint != 0;
}

// One overload a kind of field. The value is read by the kind of the field, whatever wire type the
// tag has. False ends the whole read.
template <class Message, class T, Encoding encoding>
bool readField(Message& message, PBDataReader& reader,
               const ScalarField<Message, T, encoding>& field) {
  Presence::set(message, field.presenceBit, true);
  message.*field.member = decodedScalar<encoding>(PBReaderReadVarint(reader));
  return true;
}

template <class Message>
bool readField(Message& message, PBDataReader& reader, const EnumField<Message>& field) {
  Presence::set(message, field.presenceBit, true);
  message.*field.member = decodedScalar<Encoding::int32>(PBReaderReadVarint(reader));
  return true;
}

template <class Message>
bool readField(Message& message, PBDataReader& reader, const DataField<Message>& field) {
  message.*field.member = PBReaderReadData(reader);
  return true;
}

template <class Message>
bool readField(Message& message, PBDataReader& reader, const StringField<Message>& field) {
  message.*field.member = PBReaderReadString(reader);
  return true;
}

template <class Nested>
bool readNested(Nested& nested, PBDataReader& reader) {
  PBReaderMark mark;
  if (!PBReaderPlaceMark(reader, mark) || !readMessage(nested, reader)) return false;
  PBReaderRecallMark(reader, mark);
  return true;
}

template <class Message, class Nested>
bool readField(Message& message, PBDataReader& reader, const MessageField<Message, Nested>& field) {
  message.*field.member = std::make_shared<Nested>();
  return readNested(*(message.*field.member), reader);
}

template <class Message, class Nested>
bool readField(Message& message, PBDataReader& reader,
               const RepeatedMessageField<Message, Nested>& field) {
  auto& elements = message.*field.member;
  elements.push_back(std::make_shared<Nested>());
  return readNested(*elements.back(), reader);
}

template <class Message, class T, Encoding encoding>
bool readField(Message& message, PBDataReader& reader,
               const PackedField<Message, T, encoding>& field) {
  PBReaderMark mark;
  if (!PBReaderPlaceMark(reader, mark)) return false;
  while (reader._pos < reader._length && !reader._error) {
    (message.*field.member).values.push_back(decodedScalar<encoding>(PBReaderReadVarint(reader)));
  }
  PBReaderRecallMark(reader, mark);
  return true;
}

// Reads the value of the field with this number, or skips it when the message has no such field.
template <class Message>
bool readFieldNumbered(Message& message, PBDataReader& reader, std::uint32_t number,
                       std::uint8_t wireType) {
  bool known = false;
  bool whole = true;
  std::apply(
      [&](const auto&... field) {
        known =
            ((number == field.number && (whole = readField(message, reader, field), true)) || ...);
      },
      Message::kFields);
  return known ? whole : PBReaderSkipValueWithTag(reader, number, wireType);
}

template <class Message>
bool readMessage(Message& message, PBDataReader& reader) {
  constexpr std::uint8_t kEndOfGroup = 4;
  while (reader._pos < reader._length && !reader._error) {
    const std::uint64_t tag = PBReaderReadVarint(reader);
    const auto wireType = static_cast<std::uint8_t>(tag & 7);
    if (reader._error || wireType == kEndOfGroup) break;
    const auto number = static_cast<std::uint32_t>(tag >> 3 & 0xFFFF);
    if (KBBMetricUtility::isValidMetricIdTag(number, Message::kClassName)) {
      // A metric identifier in place of a field: its varint is taken and logged, never stored.
      logUnknownTag(number, decodedScalar<Encoding::uint32>(PBReaderReadVarint(reader)));
      continue;
    }
    if (!readFieldNumbered(message, reader, number, wireType)) return false;
  }
  return !reader._error;
}

}  // namespace qel
