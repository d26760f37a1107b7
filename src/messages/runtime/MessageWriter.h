// The writing rules of every message class.
#pragma once

#include <algorithm>
#include <tuple>

#include "messages/runtime/Fields.h"
#include "messages/runtime/PBDataWriter.h"
#include "messages/runtime/Presence.h"

namespace qel {

template <class Message>
void writeMessage(const Message& message, PBDataWriter& writer);

// The varint that a value is on the wire.
template <Encoding encoding, class T>
std::uint64_t encodedScalar(T value) {
  if constexpr (encoding == Encoding::int32) return static_cast<std::uint64_t>(std::int64_t{value});
  if constexpr (encoding == Encoding::sint32) return PBZigZag(value);
  return static_cast<std::uint64_t>(value);
}

// Room is made once for all the scalars of a message, which then are put where a pointer stands.
// The most bytes that a field takes with its tag and its length; 0 where there is no such bound.
inline constexpr std::size_t kLongestTag = 2;

constexpr std::size_t longestScalar(Encoding encoding) {
  switch (encoding) {
    case Encoding::boolean:
      return 1;
    case Encoding::uint32:
    case Encoding::sint32:
      return 5;
    default:
      return kLongestVarint;
  }
}

template <class Field>
inline constexpr std::size_t kFieldRoom = 0;
template <class Message, class T, Encoding encoding>
inline constexpr std::size_t kFieldRoom<ScalarField<Message, T, encoding>> =
    kLongestTag + longestScalar(encoding);
template <class Message>
inline constexpr std::size_t kFieldRoom<EnumField<Message>> = kLongestTag + kLongestVarint;

template <class Fields>
inline constexpr std::size_t kRoomOf = 0;
template <class... Field>
inline constexpr std::size_t kRoomOf<std::tuple<Field...>> = (kFieldRoom<Field> + ...);
template <class Fields>
inline constexpr bool kOnlyScalars = false;
template <class... Field>
inline constexpr bool kOnlyScalars<std::tuple<Field...>> = ((kFieldRoom<Field> > 0) && ...);

template <class Message>
inline constexpr std::size_t kRoom = kRoomOf<FieldsOf<Message>>;

// A nested message of scalars whose length always is one byte.
template <class Message>
inline constexpr bool kIsSmall = kOnlyScalars<FieldsOf<Message>>&& kRoom<Message> < 0x80;

inline std::uint8_t* putTag(std::uint8_t* at, std::uint32_t number, std::uint32_t wireType) {
  return PBPutVarint(at, number << 3 | wireType);
}

// Where a message is written from and to. Its presence word is a copy: every byte that is written
// might else have changed it.
template <class Message>
struct Writing {
  const Message& message;
  PBDataWriter& writer;
  const decltype(Presence::word(message)) present = Presence::word(message);

  template <class Field>
  bool has(const Field& field) const {
    return (present >> field.presenceBit & 1) != 0;
  }
  template <class Field>
  const auto& held(const Field& field) const {
    return message.*field.member;
  }
  // Writes through the functions of the writer, with room for the message's scalars again
  // afterwards.
  template <class Write>
  std::uint8_t* between(std::uint8_t* at, Write&& write) const {
    writer.writtenTo(at);
    write();
    return writer.room(kRoom<Message>);
  }
};

// One overload a kind of field; what is absent writes nothing. Each takes the place where writing
// stands, with room for the scalars that are still to come, and gives back such a place.
template <class Message, class T, Encoding encoding>
[[gnu::always_inline]] inline std::uint8_t* writeField(
    const Writing<Message>& from, std::uint8_t* at,
    const ScalarField<Message, T, encoding>& field) {
  if (!from.has(field)) return at;
  return PBPutVarint(putTag(at, field.number, 0), encodedScalar<encoding>(from.held(field)));
}

template <class Message>
[[gnu::always_inline]] inline std::uint8_t* writeField(const Writing<Message>& from,
                                                       std::uint8_t* at,
                                                       const EnumField<Message>& field) {
  if (!from.has(field)) return at;
  return PBPutVarint(putTag(at, field.number, 0), encodedScalar<Encoding::int32>(from.held(field)));
}

template <class Message>
std::uint8_t* writeField(const Writing<Message>& from, std::uint8_t* at,
                         const DataField<Message>& field) {
  const auto& data = from.held(field);
  if (!data) return at;
  return from.between(at, [&] { PBDataWriterWriteDataField(from.writer, *data, field.number); });
}

template <class Message>
std::uint8_t* writeField(const Writing<Message>& from, std::uint8_t* at,
                         const StringField<Message>& field) {
  const auto& text = from.held(field);
  if (!text) return at;
  return from.between(at, [&] { PBDataWriterWriteStringField(from.writer, *text, field.number); });
}

// Of a small nested message: its tag, its length and itself.
template <class Nested>
inline constexpr std::size_t kSmallRoom = kLongestTag + 1 + kRoom<Nested>;

template <class Nested>
[[gnu::always_inline]] inline std::uint8_t* putSmall(const Nested& nested, PBDataWriter& writer,
                                                     std::uint8_t* at, std::uint32_t number) {
  std::uint8_t* length = putTag(at, number, 2);
  at = length + 1;
  const Writing<Nested> from{nested, writer};
  forEachField<Nested>([&](const auto& field) { at = writeField(from, at, field); });
  *length = static_cast<std::uint8_t>(at - length - 1);
  return at;
}

// As PBDataWriterWriteSubmessage, with the class known.
template <class Nested>
void writeNested(const Nested& nested, PBDataWriter& writer, std::uint32_t number) {
  PBDataWriterMark mark;
  PBDataWriterPlaceMark(writer, mark, number);
  writeMessage(nested, writer);
  PBDataWriterRecallMark(writer, mark);
}

// Any number of nested messages of one field.
template <class Message, class Nested>
[[gnu::always_inline]] inline std::uint8_t* writeAll(PBDataWriter& writer, std::uint8_t* at,
                                                     std::uint32_t number,
                                                     std::span<const std::shared_ptr<Nested>> all) {
  writer.writtenTo(at);
  if constexpr (kIsSmall<Nested>) {
    at = writer.room(all.size() * kSmallRoom<Nested> + kRoom<Message>);
    for (const auto& nested : all) at = putSmall(*nested, writer, at, number);
    return at;
  } else {
    for (const auto& nested : all) writeNested(*nested, writer, number);
    return writer.room(kRoom<Message>);
  }
}

template <class Message, class Nested>
std::uint8_t* writeField(const Writing<Message>& from, std::uint8_t* at,
                         const MessageField<Message, Nested>& field) {
  const auto& nested = from.held(field);
  if (!nested) return at;
  return writeAll<Message, Nested>(from.writer, at, field.number, {&nested, 1});
}

template <class Message, class Nested>
std::uint8_t* writeField(const Writing<Message>& from, std::uint8_t* at,
                         const RepeatedMessageField<Message, Nested>& field) {
  return writeAll<Message, Nested>(from.writer, at, field.number, from.held(field));
}

template <class Message, class T, Encoding encoding>
std::uint8_t* writeField(const Writing<Message>& from, std::uint8_t* at,
                         const PackedField<Message, T, encoding>& field) {
  const auto& values = from.held(field).values;
  if (values.empty()) return at;
  return from.between(at, [&] {
    PBDataWriter& writer = from.writer;
    PBDataWriterMark mark;
    PBDataWriterPlaceMark(writer, mark, field.number);
    for (const T value : values) {
      writer.writtenTo(PBPutVarint(writer.room(kLongestVarint), encodedScalar<encoding>(value)));
    }
    PBDataWriterRecallMark(writer, mark);
  });
}

template <class Message>
void writeMessage(const Message& message, PBDataWriter& writer) {
  std::uint8_t* at = writer.room(kRoom<Message>);
  const Writing<Message> from{message, writer};
  forEachField<Message>([&](const auto& field) { at = writeField(from, at, field); });
  writer.writtenTo(at);
}

}  // namespace qel
