// The reading rules of every message class.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <tuple>
#include <utility>

#include "messages/runtime/AnyOrderReader.h"
#include "messages/runtime/FieldOrder.h"
#include "messages/runtime/Presence.h"

namespace qel {

// Reads the message from the cursor to its end; where reading stopped, damaged if the bytes are.
template <class Message>
Cursor readMessage(Message& message, Cursor cursor);

template <class Message>
std::shared_ptr<Message> makeMessage() {
  return std::allocate_shared<Message>(SmallBlockAllocator<Message>());
}

// One overload a kind of field. The value is read by the kind of the field, whatever wire type the
// tag has. What is read of a damaged value stays in the message.
template <class Message, class T, Encoding encoding>
void setField(Message& message, const ScalarField<Message, T, encoding>& field,
              std::uint64_t varint) {
  Presence::set(message, field.presenceBit, true);
  message.*field.member = decodedScalar<encoding>(varint);
}

template <class Message>
void setField(Message& message, const EnumField<Message>& field, std::uint64_t varint) {
  Presence::set(message, field.presenceBit, true);
  message.*field.member = decodedScalar<Encoding::int32>(varint);
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
[[gnu::always_inline]] inline Cursor readNested(Nested& nested, Cursor cursor) {
  const Cursor part = readDelimited(cursor);
  if (part.isDamaged()) return part;
  return {readMessage(nested, part).at, cursor.end};
}

template <class Message, class Nested>
Cursor readField(Message& message, Cursor cursor, const MessageField<Message, Nested>& field) {
  message.*field.member = makeMessage<Nested>();
  return readNested(*(message.*field.member), cursor);
}

// Becomes a message in the place where it is asked for, without one before to move from.
template <class Nested>
struct MadeInPlace {
  operator std::shared_ptr<Nested>() const { return makeMessage<Nested>(); }
};

template <class Nested>
[[gnu::always_inline]] inline Cursor readElement(MessageList<Nested>& elements, Cursor cursor) {
  return readNested(*elements.emplace_back(MadeInPlace<Nested>()), cursor);
}

template <class Message, class Nested>
Cursor readField(Message& message, Cursor cursor,
                 const RepeatedMessageField<Message, Nested>& field) {
  auto& elements = message.*field.member;
  if (elements.empty()) reserveUsual(elements, cursor);
  return readElement(elements, cursor);
}

template <class Message, class T, Encoding encoding>
Cursor readField(Message& message, Cursor cursor, const PackedField<Message, T, encoding>& field) {
  Cursor run = readDelimited(cursor);
  while (!run.isAtEnd()) {
    const auto [value, next] = readVarint(run);
    (message.*field.member).values.push_back(decodedScalar<encoding>(value));
    run.at = next;
  }
  return {run.at, cursor.end};
}

// Takes fields into a message.
template <class Message>
struct MessageTarget {
  static constexpr bool kStopsAtEnd = true;

  template <std::size_t index, class Field>
  [[gnu::always_inline]] void set(const Field& field, std::uint64_t varint) {
    setField(message, field, varint);
  }
  template <class Tag, std::size_t index, class Field>
  [[gnu::always_inline]] Cursor read(Cursor cursor, const Field& field) {
    return readField(message, cursor, field);
  }
  template <class Tag, std::size_t index, class Nested>
  Cursor read(Cursor cursor, const RepeatedMessageField<Message, Nested>& field) {
    auto& elements = message.*field.member;
    if (elements.empty()) reserveUsual(elements, cursor);
    for (;; cursor = Tag::behind(cursor)) {
      cursor = readElement(elements, cursor);
      if (cursor.isAtEnd() || !Tag::standsAt(cursor)) return cursor;
    }
  }
  template <std::size_t index, class Field>
  void leaveOut(const Field&) {}

  Message& message;
};

template <class Message, class Field>
[[gnu::always_inline]] inline Cursor readAnyField(Message& message, Cursor cursor,
                                                  const Field& field) {
  if constexpr (kIsVarint<Field>) {
    const auto [varint, next] = readVarint(cursor);
    setField(message, field, varint);
    return {next, cursor.end};
  } else {
    return readField(message, cursor, field);
  }
}

template <class Message, std::size_t... index>
[[gnu::always_inline]] inline Cursor readPlaced(Message& message, Cursor cursor, std::size_t place,
                                                std::index_sequence<index...>) {
  static_cast<void>(
      ((place == index &&
        (cursor = readAnyField(message, cursor, std::get<index>(kFieldsOf<Message>)), true)) ||
       ...));
  return cursor;
}

// Apart from readMessage, which then needs no target in memory.
template <class Message>
[[gnu::noinline]] Cursor readRest(Message& message, Cursor cursor) {
  using Fields = std::make_index_sequence<std::tuple_size_v<FieldsOf<Message>>>;
  return readInAnyOrder(PlanOf<Message>::kPlan, cursor, [&message](Cursor at, std::size_t place) {
    return readPlaced(message, at, place, Fields());
  });
}

// The order in which fields are written is the one in which nearly all arrive: it is tried first,
// at the cost of a comparison a field, and says the same as any order does.
template <class Message>
Cursor readMessage(Message& message, Cursor cursor) {
  MessageTarget<Message> target{message};
  cursor = readInOrder<Message>(target, cursor);
  if (cursor.isAtEnd()) return cursor;
  return readRest(message, cursor);
}

}  // namespace qel
