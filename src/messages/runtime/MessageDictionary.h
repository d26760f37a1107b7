// The dictionary form of every message class.
#pragma once

#include "base/Dictionary.h"
#include "messages/runtime/Fields.h"
#include "messages/runtime/Presence.h"

namespace qel {

template <class Message>
Dictionary messageDictionary(const Message& message);

// "(unknown: N)", for a value without a name.
Text unknownEnumText(std::int32_t value);

// One overload a kind of field; what is absent adds nothing, but a packed list is always there.
// Keys and enumeration names are borrowed from the constant tables.
template <class Message, class T, Encoding encoding>
void addField(Dictionary& dictionary, const Message& message,
              const ScalarField<Message, T, encoding>& field) {
  if (!Presence::get(message, field.presenceBit)) return;
  dictionary.append(Text::borrowed(field.key), message.*field.member);
}

template <class Message>
void addField(Dictionary& dictionary, const Message& message, const EnumField<Message>& field) {
  if (!Presence::get(message, field.presenceBit)) return;
  const std::int32_t value = message.*field.member;
  const std::string_view name = nameOf(field.names, value);
  dictionary.append(Text::borrowed(field.key),
                    name.empty() ? unknownEnumText(value) : Text::borrowed(name));
}

template <class Message>
void addField(Dictionary& dictionary, const Message& message, const DataField<Message>& field) {
  const auto& data = message.*field.member;
  if (data) dictionary.append(Text::borrowed(field.key), *data);
}

template <class Message>
void addField(Dictionary& dictionary, const Message& message, const StringField<Message>& field) {
  const auto& text = message.*field.member;
  if (text) dictionary.append(Text::borrowed(field.key), *text);
}

template <class Message, class Nested>
void addField(Dictionary& dictionary, const Message& message,
              const MessageField<Message, Nested>& field) {
  const auto& nested = message.*field.member;
  if (nested) dictionary.append(Text::borrowed(field.key), messageDictionary(*nested));
}

template <class Message, class Nested>
void addField(Dictionary& dictionary, const Message& message,
              const RepeatedMessageField<Message, Nested>& field) {
  const auto& elements = message.*field.member;
  if (elements.empty()) return;
  List list;
  list.reserve(elements.size());
  for (const auto& element : elements) list.emplace_back(messageDictionary(*element));
  dictionary.append(Text::borrowed(field.key), std::move(list));
}

template <class Message, class T, Encoding encoding>
void addField(Dictionary& dictionary, const Message& message,
              const PackedField<Message, T, encoding>& field) {
  const auto& values = (message.*field.member).values;
  dictionary.append(Text::borrowed(field.key), List(values.begin(), values.end()));
}

template <class Message>
Dictionary messageDictionary(const Message& message) {
  Dictionary dictionary;
  dictionary.reserve(std::tuple_size_v<decltype(Message::kFields)>);
  forEachField<Message>([&](const auto& field) { addField(dictionary, message, field); });
  return dictionary;
}

}  // namespace qel
