// Reaching into messages by the rows of their field tables.
#pragma once

#include "messages/runtime/Fields.h"
#include "messages/runtime/Presence.h"

namespace qel::testing {

template <class Field>
constexpr bool kIsScalar = requires(const Field& field) {
  field.presenceBit;
};

template <class Field>
constexpr bool kIsMessage = false;
template <class Message, class Nested>
constexpr bool kIsMessage<MessageField<Message, Nested>> = true;

template <class Field>
constexpr bool kIsMessageList = false;
template <class Message, class Nested>
constexpr bool kIsMessageList<RepeatedMessageField<Message, Nested>> = true;

template <class Field>
constexpr bool kIsPacked = false;
template <class Message, class T, Encoding encoding>
constexpr bool kIsPacked<PackedField<Message, T, encoding>> = true;

// Makes a field absent, whatever its kind.
template <class Message, class Field>
void makeAbsent(Message& message, const Field& field) {
  if constexpr (kIsScalar<Field>) Presence::set(message, field.presenceBit, false);
  message.*field.member = {};
}

// Whether the field has a presence bit that is set, a reference, or at least one element.
template <class Message, class Field>
bool isPresent(const Message& message, const Field& field) {
  if constexpr (kIsScalar<Field>) {
    return Presence::get(message, field.presenceBit);
  } else if constexpr (kIsMessageList<Field>) {
    return !(message.*field.member).empty();
  } else if constexpr (kIsPacked<Field>) {
    return (message.*field.member).count() > 0;
  } else {
    return static_cast<bool>(message.*field.member);
  }
}

}  // namespace qel::testing
