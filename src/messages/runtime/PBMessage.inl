// The operations of every message class, over its field table.
#pragma once

#include <string>

#include "base/FatalError.h"
#include "messages/runtime/DictionaryReader.h"
#include "messages/runtime/MessageCheck.h"
#include "messages/runtime/MessageReader.h"
#include "messages/runtime/MessageRelations.h"
#include "messages/runtime/MessageWriter.h"
#include "messages/runtime/PBMessage.h"

namespace qel {

// `message` as one of the class, which it must be exactly. Message classes are final, so a cast
// that succeeds says just that.
template <class Message, class Codable>
auto& sameClass(Codable& message, std::string_view operation) {
  using Wanted = std::conditional_t<std::is_const_v<Codable>, const Message, Message>;
  auto* same = dynamic_cast<Wanted*>(&message);
  if (!same) {
    fatalError(std::string(operation) + ": " + std::string(message.className()) + " is no " +
               std::string(Message::kClassName));
  }
  return *same;
}

template <class Message>
std::shared_ptr<Message> PBMessage<Message>::initWithData(ByteView bytes) {
  auto message = makeMessage<Message>();
  if (bytes.empty()) return message;
  const Cursor whole{bytes.data(), bytes.data() + bytes.size()};
  if (readMessage(*message, whole).isDamaged()) return nullptr;
  return message;
}

template <class Message>
std::optional<Dictionary> PBMessage<Message>::dictionaryWithData(ByteView bytes) {
  std::optional<Dictionary> dictionary(std::in_place);
  const Cursor whole{bytes.data(), bytes.data() + bytes.size()};
  if (readDictionary<Message>(*dictionary, whole).isDamaged()) dictionary.reset();
  return dictionary;
}

template <class Message>
bool PBMessage<Message>::isReadable(ByteView bytes) {
  const Cursor whole{bytes.data(), bytes.data() + bytes.size()};
  return !checkMessage(PlanOf<Message>::kPlan, whole).isDamaged();
}

template <class Message>
Dictionary PBMessage<Message>::dictionaryRepresentation() const {
  return messageDictionary(self());
}

template <class Message>
bool PBMessage<Message>::readFrom(PBDataReader& reader) {
  const ByteView left = reader.left();
  if (left.empty() || reader._error) return !reader._error;
  const Cursor part{left.data(), left.data() + left.size()};
  const Cursor stopped = readMessage(self(), part);
  reader._error = stopped.isDamaged();
  reader._pos = reader._error ? reader._length
                              : reader._pos + static_cast<std::uint64_t>(stopped.at - part.at);
  return !reader._error;
}

template <class Message>
void PBMessage<Message>::writeTo(PBDataWriter& writer) const {
  writeMessage(self(), writer);
}

template <class Message>
void PBMessage<Message>::copyTo(PBCodable& destination) const {
  copyMessage(sameClass<Message>(destination, "copyTo"), self());
}

template <class Message>
std::shared_ptr<Message> PBMessage<Message>::deepCopy() const {
  auto copy = makeMessage<Message>();
  copyMessage(*copy, self());
  detachMessage(*copy);
  return copy;
}

template <class Message>
std::shared_ptr<PBCodable> PBMessage<Message>::copyWithZone() const {
  return deepCopy();
}

template <class Message>
bool PBMessage<Message>::isEqual(const PBCodable& other) const {
  const auto* same = dynamic_cast<const Message*>(&other);
  return same && equalMessages(self(), *same);
}

template <class Message>
std::size_t PBMessage<Message>::hash() const {
  return hashMessage(self());
}

template <class Message>
void PBMessage<Message>::mergeFrom(const PBCodable& source) {
  mergeMessage(self(), sameClass<Message>(source, "mergeFrom"));
}

}  // namespace qel
