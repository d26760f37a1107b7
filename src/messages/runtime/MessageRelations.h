// Copying, merging, comparing and hashing of every message class.
#pragma once

#include <functional>
#include <string_view>

#include "messages/runtime/Fields.h"
#include "messages/runtime/PBRepeated.h"
#include "messages/runtime/Presence.h"

namespace qel {

template <class Message>
void mergeMessage(Message& destination, const Message& source);
template <class Message>
bool equalMessages(const Message& a, const Message& b);
template <class Message>
std::size_t hashMessage(const Message& message);

// Fields with a presence bit, and fields whose presence is a reference that is not null.
template <class Field>
concept HasPresenceBit = requires(Field field) {
  field.presenceBit;
};
template <class Held>
concept IsNullable = requires(const Held& held) {
  static_cast<bool>(held);
  *held;
};
template <class Field, class Message>
using HeldBy =
    std::remove_cvref_t<decltype(std::declval<Message&>().*std::declval<Field>().member)>;

// copyTo: the present fields of `source` replace those of `destination`.
template <class Message, class Field>
void copyField(Message& destination, const Message& source, const Field& field) {
  if constexpr (HasPresenceBit<Field>) {
    if (!Presence::get(source, field.presenceBit)) return;
    Presence::set(destination, field.presenceBit, true);
  } else if constexpr (IsNullable<HeldBy<Field, Message>>) {
    if (!(source.*field.member)) return;
  }
  destination.*field.member = source.*field.member;
}

template <class Message, class Nested>
void copyField(Message& destination, const Message& source,
               const RepeatedMessageField<Message, Nested>& field) {
  if (!(source.*field.member).empty()) destination.*field.member = source.*field.member;
}

// copyWithZone: nested messages are copied too, all the way down.
template <class Message, class Field>
void detachField(Message&, const Field&) {}

template <class Message, class Nested>
void detachField(Message& copy, const MessageField<Message, Nested>& field) {
  auto& nested = copy.*field.member;
  if (nested) nested = nested->deepCopy();
}

template <class Message, class Nested>
void detachField(Message& copy, const RepeatedMessageField<Message, Nested>& field) {
  for (auto& element : copy.*field.member) element = element->deepCopy();
}

// mergeFrom: as copyTo, but lists grow and nested messages merge.
template <class Message, class Field>
void mergeField(Message& destination, const Message& source, const Field& field) {
  copyField(destination, source, field);
}

template <class Message, class Nested>
void mergeField(Message& destination, const Message& source,
                const MessageField<Message, Nested>& field) {
  const auto& theirs = source.*field.member;
  auto& ours = destination.*field.member;
  if (!theirs) return;
  if (ours) {
    mergeMessage(*ours, *theirs);
  } else {
    ours = theirs;
  }
}

// A list may be merged into itself, so its size is fixed first.
template <class Elements>
void appendAll(Elements& destination, const Elements& source) {
  const std::size_t count = source.size();
  destination.reserve(destination.size() + count);
  for (std::size_t i = 0; i < count; ++i) destination.push_back(source[i]);
}

template <class Message, class Nested>
void mergeField(Message& destination, const Message& source,
                const RepeatedMessageField<Message, Nested>& field) {
  appendAll(destination.*field.member, source.*field.member);
}

template <class Message, class T, Encoding encoding>
void mergeField(Message& destination, const Message& source,
                const PackedField<Message, T, encoding>& field) {
  appendAll((destination.*field.member).values, (source.*field.member).values);
}

template <class Held>
bool equalHeld(const Held& a, const Held& b) {
  return a == b;
}

template <class Nested>
bool equalHeld(const std::shared_ptr<Nested>& a, const std::shared_ptr<Nested>& b) {
  return a && b ? equalMessages(*a, *b) : a == b;
}

template <class Nested>
bool equalHeld(const MessageList<Nested>& a, const MessageList<Nested>& b) {
  return std::ranges::equal(a, b, [](const auto& x, const auto& y) { return equalHeld(x, y); });
}

inline bool equalHeld(const PBRepeatedUInt32& a, const PBRepeatedUInt32& b) {
  return PBRepeatedUInt32IsEqual(a, b);
}

inline bool equalHeld(const PBRepeatedInt32& a, const PBRepeatedInt32& b) {
  return PBRepeatedInt32IsEqual(a, b);
}

template <class Message, class Field>
bool equalField(const Message& a, const Message& b, const Field& field) {
  if constexpr (HasPresenceBit<Field>) {
    const bool present = Presence::get(a, field.presenceBit);
    if (present != Presence::get(b, field.presenceBit)) return false;
    if (!present) return true;
  }
  return equalHeld(a.*field.member, b.*field.member);
}

inline std::size_t hashHeld(const std::optional<Bytes>& data) {
  if (!data) return 0;
  const auto* characters = reinterpret_cast<const char*>(data->data());
  return std::hash<std::string_view>()({characters, data->size()});
}

inline std::size_t hashHeld(const std::optional<std::string>& text) {
  return text ? std::hash<std::string_view>()(*text) : 0;
}

inline std::size_t hashHeld(const PBRepeatedUInt32& array) { return PBRepeatedUInt32Hash(array); }
inline std::size_t hashHeld(const PBRepeatedInt32& array) { return PBRepeatedInt32Hash(array); }

template <class Nested>
std::size_t hashHeld(const std::shared_ptr<Nested>& nested) {
  return nested ? hashMessage(*nested) : 0;
}

template <class Nested>
std::size_t hashHeld(const MessageList<Nested>& elements) {
  std::size_t result = elements.size();
  for (const auto& element : elements) result = result * 31 + hashHeld(element);
  return result;
}

template <class Message, class Field>
std::size_t hashField(const Message& message, const Field& field) {
  constexpr std::uint64_t kScalarFactor = 2654435761;
  if constexpr (HasPresenceBit<Field>) {
    if (!Presence::get(message, field.presenceBit)) return 0;
    // Signed values widen with their sign.
    return static_cast<std::size_t>(static_cast<std::uint64_t>(message.*field.member) *
                                    kScalarFactor);
  } else {
    return hashHeld(message.*field.member);
  }
}

template <class Message>
void copyMessage(Message& destination, const Message& source) {
  forEachField<Message>([&](const auto& field) { copyField(destination, source, field); });
}

template <class Message>
void detachMessage(Message& copy) {
  forEachField<Message>([&](const auto& field) { detachField(copy, field); });
}

template <class Message>
void mergeMessage(Message& destination, const Message& source) {
  forEachField<Message>([&](const auto& field) { mergeField(destination, source, field); });
}

template <class Message>
bool equalMessages(const Message& a, const Message& b) {
  bool equal = true;
  forEachField<Message>([&](const auto& field) { equal = equal && equalField(a, b, field); });
  return equal;
}

template <class Message>
std::size_t hashMessage(const Message& message) {
  std::size_t result = 0;
  forEachField<Message>([&](const auto& field) { result ^= hashField(message, field); });
  return result;
}

}  // namespace qel
