// What every generated message class inherits: its operations, made from its field table.
//
// The bodies are in PBMessage.inl, which only the generated source files include.
#pragma once

#include <array>
#include <memory>
#include <optional>

#include "messages/runtime/Fields.h"
#include "messages/runtime/PBCodable.h"
#include "messages/runtime/Presence.h"

namespace qel {

template <class Message>
class PBMessage : public PBCodable {
 public:
  // A message from its encoded form, or nothing when the bytes are damaged. No bytes at all are a
  // message without fields.
  static std::shared_ptr<Message> initWithData(ByteView bytes);
  // The dictionary form of that message, or nothing, by a shorter way.
  static std::optional<Dictionary> dictionaryWithData(ByteView bytes);
  // Whether there would be a message. Takes no memory.
  static bool isReadable(ByteView bytes);

  std::string_view className() const final { return Message::kClassName; }
  Dictionary dictionaryRepresentation() const final;
  bool readFrom(PBDataReader& reader) final;
  void writeTo(PBDataWriter& writer) const final;
  void copyTo(PBCodable& destination) const final;
  std::shared_ptr<PBCodable> copyWithZone() const final;
  bool isEqual(const PBCodable& other) const final;
  std::size_t hash() const final;
  void mergeFrom(const PBCodable& source) final;

  // copyWithZone with the class known.
  std::shared_ptr<Message> deepCopy() const;

 private:
  const Message& self() const { return static_cast<const Message&>(*this); }
  Message& self() { return static_cast<Message&>(*this); }
};

}  // namespace qel
