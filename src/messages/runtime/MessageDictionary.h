// The dictionary form of every message class.
#pragma once

#include "base/Value.h"
#include "messages/runtime/Fields.h"
#include "messages/runtime/Presence.h"

namespace qel {

template <class Message>
Dictionary messageDictionary(const Message& message);

// "(unknown: N)", for a value without a name.
Text unknownEnumText(std::int32_t value);

inline Text enumText(std::span<const EnumName> names, std::int32_t value) {
  const Name name = nameOf(names, value);
  return name.empty() ? unknownEnumText(value) : Text(name);
}

// One overload a kind of field; what is absent adds nothing, but a packed list is always there.
using Entries = Dictionary::Entries::Filling;

template <class Message, class T, Encoding encoding>
void addField(Entries& entries, const Message& message,
              const ScalarField<Message, T, encoding>& field) {
  if (Presence::get(message, field.presenceBit)) entries.append(field.key, message.*field.member);
}

template <class Message>
void addField(Entries& entries, const Message& message, const EnumField<Message>& field) {
  if (!Presence::get(message, field.presenceBit)) return;
  entries.append(field.key, enumText(field.names, message.*field.member));
}

template <class Message>
void addField(Entries& entries, const Message& message, const DataField<Message>& field) {
  const auto& data = message.*field.member;
  if (data) entries.append(field.key, *data);
}

template <class Message>
void addField(Entries& entries, const Message& message, const StringField<Message>& field) {
  const auto& text = message.*field.member;
  if (text) entries.append(field.key, *text);
}

template <class Message, class Nested>
void addField(Entries& entries, const Message& message,
              const MessageField<Message, Nested>& field) {
  const auto& nested = message.*field.member;
  if (nested) entries.append(field.key, messageDictionary(*nested));
}

template <class Nested>
List messageDictionaries(const MessageList<Nested>& elements) {
  List list;
  {
    List::Filling filling(list, elements.size());
    for (const auto& element : elements) filling.append(messageDictionary(*element));
  }
  return list;
}

template <class Message, class Nested>
void addField(Entries& entries, const Message& message,
              const RepeatedMessageField<Message, Nested>& field) {
  const auto& elements = message.*field.member;
  if (!elements.empty()) entries.append(field.key, messageDictionaries(elements));
}

template <class Message, class T, Encoding encoding>
void addField(Entries& entries, const Message& message,
              const PackedField<Message, T, encoding>& field) {
  const auto& values = (message.*field.member).values;
  entries.append(field.key, List(values.begin(), values.end()));
}

// Whether the field has an entry: see addField.
template <class Message, class Field>
bool hasEntry(const Message& message, const Field& field) {
  if constexpr (requires { field.presenceBit; }) {
    return Presence::get(message, field.presenceBit);
  } else if constexpr (kIsPacked<Field>) {
    return true;
  } else if constexpr (requires { (message.*field.member).empty(); }) {
    return !(message.*field.member).empty();
  } else {
    return static_cast<bool>(message.*field.member);
  }
}

template <class Message>
Dictionary messageDictionary(const Message& message) {
  Dictionary dictionary;
  std::size_t count = 0;
  forEachField<Message>([&](const auto& field) { count += std::size_t{hasEntry(message, field)}; });
  if (count > 0) {
    Entries entries(dictionary.entries(), count);
    forEachField<Message>([&](const auto& field) { addField(entries, message, field); });
  }
  return dictionary;
}

}  // namespace qel
