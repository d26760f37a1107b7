// The reading rules of every message class.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <tuple>
#include <type_traits>
#include <utility>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/runtime/Cursor.h"
#include "messages/runtime/Fields.h"
#include "messages/runtime/Presence.h"

namespace qel {

// Logs "Unknown tag: %x:%u".
void logUnknownTag(std::uint32_t fieldNumber, std::uint32_t value);

// Skips the value of a field that the message does not have.
Cursor skipUnknown(Cursor cursor, std::uint32_t fieldNumber, std::uint8_t wireType);

// Reads the message from the cursor to its end; where reading stopped, damaged if the bytes are.
template <class Message>
Cursor readMessage(Message& message, Cursor cursor);

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

// The part of the input that a varint length in front of it gives; damaged when it is not all
// there.
inline Cursor readDelimited(Cursor cursor) {
  const auto [length, next] = readVarint(cursor);
  if (!next || length > static_cast<std::uint64_t>(cursor.end - next)) return Cursor::damaged();
  return {next, next + length};
}

// One overload a kind of field. The value is read by the kind of the field, whatever wire type the
// tag has. What is read of a damaged value stays in the message.
template <class Message, class T, Encoding encoding>
[[gnu::always_inline]] inline Cursor readField(Message& message, Cursor cursor,
                                               const ScalarField<Message, T, encoding>& field) {
  const auto [value, next] = readVarint(cursor);
  Presence::set(message, field.presenceBit, true);
  message.*field.member = decodedScalar<encoding>(value);
  return {next, cursor.end};
}

template <class Message>
[[gnu::always_inline]] inline Cursor readField(Message& message, Cursor cursor,
                                               const EnumField<Message>& field) {
  const auto [value, next] = readVarint(cursor);
  Presence::set(message, field.presenceBit, true);
  message.*field.member = decodedScalar<Encoding::int32>(value);
  return {next, cursor.end};
}

template <class Message>
Cursor readField(Message& message, Cursor cursor, const DataField<Message>& field) {
  const Cursor data = readDelimited(cursor);
  if (data.isDamaged()) return data;
  (message.*field.member).emplace(data.at, data.end);
  return {data.end, cursor.end};
}

template <class Message>
Cursor readField(Message& message, Cursor cursor, const StringField<Message>& field) {
  const Cursor text = readDelimited(cursor);
  if (text.isDamaged()) return text;
  (message.*field.member).emplace(text.at, text.end);
  return {text.end, cursor.end};
}

// A nested message that ends early leaves the rest of its part to the outer one.
template <class Nested>
Cursor readNested(Nested& nested, Cursor cursor) {
  const Cursor part = readDelimited(cursor);
  if (part.isDamaged()) return part;
  return {readMessage(nested, part).at, cursor.end};
}

template <class Message, class Nested>
Cursor readField(Message& message, Cursor cursor, const MessageField<Message, Nested>& field) {
  message.*field.member = std::make_shared<Nested>();
  return readNested(*(message.*field.member), cursor);
}

template <class Message, class Nested>
Cursor readField(Message& message, Cursor cursor,
                 const RepeatedMessageField<Message, Nested>& field) {
  constexpr std::size_t kUsualCount = 4;
  auto& elements = message.*field.member;
  if (elements.capacity() == 0) elements.reserve(kUsualCount);
  return readNested(*elements.emplace_back(std::make_shared<Nested>()), cursor);
}

template <class Message, class T, Encoding encoding>
Cursor readField(Message& message, Cursor cursor, const PackedField<Message, T, encoding>& field) {
  Cursor run = readDelimited(cursor);
  while (!run.isDamaged() && !run.isAtEnd()) {
    const auto [value, next] = readVarint(run);
    (message.*field.member).values.push_back(decodedScalar<encoding>(value));
    run.at = next;
  }
  return {run.at, cursor.end};
}

// The tag with which a field is written, and whether it may come several times in a row.
template <class Field>
struct WireForm {
  static constexpr std::uint32_t kWireType = 2;
  static constexpr bool kRepeats = false;
};

template <class Message, class T, Encoding encoding>
struct WireForm<ScalarField<Message, T, encoding>> {
  static constexpr std::uint32_t kWireType = 0;
  static constexpr bool kRepeats = false;
};

template <class Message>
struct WireForm<EnumField<Message>> {
  static constexpr std::uint32_t kWireType = 0;
  static constexpr bool kRepeats = false;
};

template <class Message, class Nested>
struct WireForm<RepeatedMessageField<Message, Nested>> {
  static constexpr std::uint32_t kWireType = 2;
  static constexpr bool kRepeats = true;
};

// Whether the tag stands here, in as few bytes as it needs.
template <std::uint32_t tag>
bool standsAt(Cursor cursor) {
  static_assert(tag < 1U << 14, "field numbers of messages are below 2048");
  if constexpr (tag < 0x80) {
    return cursor.left() >= 1 && cursor.at[0] == tag;
  } else {
    return cursor.left() >= 2 && cursor.at[0] == ((tag & 0x7F) | 0x80) && cursor.at[1] == tag >> 7;
  }
}

// Reads the field with this index if it is what comes next.
template <class Message, std::size_t index>
Cursor readExpected(Message& message, Cursor cursor) {
  constexpr auto& field = std::get<index>(Message::kFields);
  using Form = WireForm<std::remove_cvref_t<decltype(field)>>;
  constexpr std::uint32_t kTag = field.number << 3 | Form::kWireType;
  if constexpr (!KBBMetricUtility::mayBeMetric(field.number)) {
    while (standsAt<kTag>(cursor)) {
      cursor = readField(message, {cursor.at + (kTag < 0x80 ? 1 : 2), cursor.end}, field);
      if (!Form::kRepeats || cursor.isDamaged()) break;
    }
  }
  return cursor;
}

// Reads fields as long as they come in the order in which they are written.
template <class Message, std::size_t... index>
Cursor readInOrder(Message& message, Cursor cursor, std::index_sequence<index...>) {
  static_cast<void>(((cursor = readExpected<Message, index>(message, cursor),
                      !cursor.isDamaged() && !cursor.isAtEnd()) &&
                     ...));
  return cursor;
}

// Reads the value of the field with this number, or skips it when the message has no such field.
template <class Message>
Cursor readNumbered(Message& message, Cursor cursor, std::uint32_t number, std::uint8_t wireType) {
  Cursor next = cursor;
  const bool known = std::apply(
      [&](const auto&... field) {
        return ((number == field.number && (next = readField(message, cursor, field), true)) ||
                ...);
      },
      Message::kFields);
  return known ? next : skipUnknown(cursor, number, wireType);
}

// Reads whatever comes, in whatever order.
template <class Message>
[[gnu::noinline]] Cursor readInAnyOrder(Message& message, Cursor cursor) {
  constexpr std::uint8_t kEndOfGroup = 4;
  while (!cursor.isDamaged() && !cursor.isAtEnd()) {
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
      cursor = readNumbered(message, cursor, number, wireType);
    }
  }
  return cursor;
}

// The order in which fields are written is the one in which nearly all arrive: it is tried first,
// at the cost of a comparison a field, and says the same as any order does.
template <class Message>
Cursor readMessage(Message& message, Cursor cursor) {
  constexpr std::size_t kFieldCount = std::tuple_size_v<decltype(Message::kFields)>;
  cursor = readInOrder(message, cursor, std::make_index_sequence<kFieldCount>());
  if (cursor.isDamaged() || cursor.isAtEnd()) return cursor;
  return readInAnyOrder(message, cursor);
}

}  // namespace qel
