// The writing rules of every message class.
#pragma once

#include "messages/runtime/Fields.h"
#include "messages/runtime/PBDataWriter.h"
#include "messages/runtime/Presence.h"

namespace qel {

template <class Message>
void writeMessage(const Message& message, PBDataWriter& writer);

template <Encoding encoding, class T>
void writeScalar(PBDataWriter& writer, T value, std::uint32_t number) {
  if constexpr (encoding == Encoding::uint64) PBDataWriterWriteUint64Field(writer, value, number);
  if constexpr (encoding == Encoding::uint32) PBDataWriterWriteUint32Field(writer, value, number);
  if constexpr (encoding == Encoding::int32) PBDataWriterWriteInt32Field(writer, value, number);
  if constexpr (encoding == Encoding::sint32) PBDataWriterWriteSint32Field(writer, value, number);
  if constexpr (encoding == Encoding::boolean) PBDataWriterWriteBOOLField(writer, value, number);
}

// One overload a kind of field; what is absent writes nothing.
template <class Message, class T, Encoding encoding>
void writeField(const Message& message, PBDataWriter& writer,
                const ScalarField<Message, T, encoding>& field) {
  if (!Presence::get(message, field.presenceBit)) return;
  writeScalar<encoding>(writer, message.*field.member, field.number);
}

template <class Message>
void writeField(const Message& message, PBDataWriter& writer, const EnumField<Message>& field) {
  if (!Presence::get(message, field.presenceBit)) return;
  writeScalar<Encoding::int32>(writer, message.*field.member, field.number);
}

template <class Message>
void writeField(const Message& message, PBDataWriter& writer, const DataField<Message>& field) {
  const auto& data = message.*field.member;
  if (data) PBDataWriterWriteDataField(writer, *data, field.number);
}

template <class Message>
void writeField(const Message& message, PBDataWriter& writer, const StringField<Message>& field) {
  const auto& text = message.*field.member;
  if (text) PBDataWriterWriteStringField(writer, *text, field.number);
}

// As PBDataWriterWriteSubmessage, with the class known.
template <class Nested>
void writeNested(const Nested& nested, PBDataWriter& writer, std::uint32_t number) {
  PBDataWriterMark mark;
  PBDataWriterPlaceMark(writer, mark, number);
  writeMessage(nested, writer);
  PBDataWriterRecallMark(writer, mark);
}

template <class Message, class Nested>
void writeField(const Message& message, PBDataWriter& writer,
                const MessageField<Message, Nested>& field) {
  const auto& nested = message.*field.member;
  if (nested) writeNested(*nested, writer, field.number);
}

template <class Message, class Nested>
void writeField(const Message& message, PBDataWriter& writer,
                const RepeatedMessageField<Message, Nested>& field) {
  for (const auto& element : message.*field.member) {
    writeNested(*element, writer, field.number);
  }
}

template <class Message, class T, Encoding encoding>
void writeField(const Message& message, PBDataWriter& writer,
                const PackedField<Message, T, encoding>& field) {
  const auto& values = (message.*field.member).values;
  if (values.empty()) return;
  PBDataWriterMark mark;
  PBDataWriterPlaceMark(writer, mark, field.number);
  for (const T value : values) writeScalar<encoding>(writer, value, kPBNoTag);
  PBDataWriterRecallMark(writer, mark);
}

template <class Message>
void writeMessage(const Message& message, PBDataWriter& writer) {
  forEachField<Message>([&](const auto& field) { writeField(message, writer, field); });
}

}  // namespace qel
