// Messages with every field of their class present.
#pragma once

#include <memory>
#include <string>

#include "messages/runtime/Fields.h"
#include "messages/runtime/Presence.h"

namespace qel::testing {

// Small numbers that follow from the field and the seed, negative ones where the field knows them;
// texts that are hard to write down; lists of `seed` modulo three entries.
template <class Message>
std::shared_ptr<Message> filledMessage(unsigned seed);

template <class Message, class T, Encoding encoding>
void fillSeeded(Message& message, const ScalarField<Message, T, encoding>& field, unsigned seed) {
  const int number = static_cast<int>((field.number * 7 + seed * 13) % 40);
  const bool isSigned = encoding == Encoding::sint32 || encoding == Encoding::int32;
  message.*field.member = static_cast<T>(isSigned && seed % 2 == 1 ? -number : number);
  Presence::set(message, field.presenceBit, true);
}
template <class Message>
void fillSeeded(Message& message, const EnumField<Message>& field, unsigned seed) {
  message.*field.member = static_cast<std::int32_t>(seed);
  Presence::set(message, field.presenceBit, true);
}
template <class Message>
void fillSeeded(Message& message, const DataField<Message>& field, unsigned seed) {
  message.*field.member = Bytes(seed, static_cast<std::uint8_t>(field.number * 29 + seed));
}
template <class Message>
void fillSeeded(Message& message, const StringField<Message>& field, unsigned seed) {
  const std::string texts[] = {"",
                               "plain",
                               "with, comma",
                               "\"quoted\"",
                               "two\r\nlines",
                               "\xC3\xA4\xE2\x82\xAC",
                               "no \xFF utf-8",
                               "=1+1"};
  message.*field.member = texts[seed % std::size(texts)];
}
template <class Message, class Nested>
void fillSeeded(Message& message, const MessageField<Message, Nested>& field, unsigned seed) {
  message.*field.member = filledMessage<Nested>(seed + 1);
}
template <class Message, class Nested>
void fillSeeded(Message& message, const RepeatedMessageField<Message, Nested>& field,
                unsigned seed) {
  qel::MessageList<Nested> entries;
  for (unsigned i = 0; i < seed % 3; ++i) entries.push_back(filledMessage<Nested>(seed + i));
  message.*field.member = entries;
}
template <class Message, class T, Encoding encoding>
void fillSeeded(Message& message, const PackedField<Message, T, encoding>& field, unsigned seed) {
  for (unsigned i = 0; i < seed % 4; ++i) {
    (message.*field.member).values.push_back(static_cast<T>(seed + i));
  }
}

template <class Message>
std::shared_ptr<Message> filledMessage(unsigned seed) {
  auto message = std::make_shared<Message>();
  forEachField<Message>([&](const auto& field) { fillSeeded(*message, field, seed); });
  return message;
}

}  // namespace qel::testing
