// What the messages of a class hold, as data: the field table without its members.
#pragma once

#include <array>
#include <cstdint>
#include <span>
#include <string_view>
#include <tuple>

#include "messages/runtime/Fields.h"

namespace qel {

enum class FieldKind : std::uint8_t {
  integer,
  boolean,
  enumeration,
  text,
  bytes,
  message,
  messageList,
  numberList,
};

struct MessageShape;

struct FieldShape {
  Name key;
  FieldKind kind;
  const MessageShape* nested = nullptr;  // of a message or a list of them
};

// Constant, in field order.
struct MessageShape {
  std::string_view className;
  std::span<const FieldShape> fields;
};

template <class Message>
struct ShapeOf;

template <class Message, class T, Encoding encoding>
constexpr FieldShape shapeOfField(const ScalarField<Message, T, encoding>& field) {
  return {field.key, encoding == Encoding::boolean ? FieldKind::boolean : FieldKind::integer};
}
template <class Message>
constexpr FieldShape shapeOfField(const EnumField<Message>& field) {
  return {field.key, FieldKind::enumeration};
}
template <class Message>
constexpr FieldShape shapeOfField(const DataField<Message>& field) {
  return {field.key, FieldKind::bytes};
}
template <class Message>
constexpr FieldShape shapeOfField(const StringField<Message>& field) {
  return {field.key, FieldKind::text};
}
template <class Message, class Nested>
constexpr FieldShape shapeOfField(const MessageField<Message, Nested>& field) {
  return {field.key, FieldKind::message, &ShapeOf<Nested>::kShape};
}
template <class Message, class Nested>
constexpr FieldShape shapeOfField(const RepeatedMessageField<Message, Nested>& field) {
  return {field.key, FieldKind::messageList, &ShapeOf<Nested>::kShape};
}
template <class Message, class T, Encoding encoding>
constexpr FieldShape shapeOfField(const PackedField<Message, T, encoding>& field) {
  return {field.key, FieldKind::numberList};
}

template <class Message>
struct ShapeOf {
  static constexpr auto kFields = std::apply(
      [](const auto&... field) { return std::array{shapeOfField(field)...}; }, kFieldsOf<Message>);
  static constexpr MessageShape kShape = {Message::kClassName, kFields};
};

}  // namespace qel
