// The rows of a message's field table. Every message class has a constant tuple of them, kFields,
// in ascending field number; the codec rules are written once over these tables. The compiler makes
// a table where it is used: what only handles messages is spared the time.
#pragma once

#include <algorithm>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <tuple>
#include <type_traits>

#include "base/Bytes.h"
#include "base/Sequence.h"
#include "base/Text.h"
#include "messages/runtime/PBRepeated.h"

namespace qel {

// How a scalar travels. All are varints; sint32 is ZigZag-coded.
enum class Encoding : std::uint8_t { uint64, uint32, int32, sint32, boolean };

// The elements of a repeated message field. They may be shared with other messages.
template <class Nested>
using MessageList = Sequence<std::shared_ptr<Nested>>;

// One name of an enumeration; tables of them are sorted by value.
struct EnumName {
  std::int32_t value;
  Name name;
};

template <class Message, class T, Encoding encoding>
struct ScalarField {
  std::uint32_t number;
  Name key;
  T Message::*member;
  unsigned presenceBit;
};

template <class Message>
struct EnumField {
  std::uint32_t number;
  Name key;
  std::int32_t Message::*member;
  unsigned presenceBit;
  std::span<const EnumName> names;
};

template <class Message>
struct DataField {
  std::uint32_t number;
  Name key;
  std::optional<Bytes> Message::*member;
};

template <class Message>
struct StringField {
  std::uint32_t number;
  Name key;
  std::optional<std::string> Message::*member;
};

template <class Message, class Nested>
struct MessageField {
  std::uint32_t number;
  Name key;
  std::shared_ptr<Nested> Message::*member;
};

template <class Message, class Nested>
struct RepeatedMessageField {
  std::uint32_t number;
  Name key;
  MessageList<Nested> Message::*member;
};

template <class Message, class T, Encoding encoding>
struct PackedField {
  std::uint32_t number;
  Name key;
  PBRepeated<T> Message::*member;
};

template <class Field>
inline constexpr bool kIsPacked = false;
template <class Message, class T, Encoding encoding>
inline constexpr bool kIsPacked<PackedField<Message, T, encoding>> = true;

// The smallest word with a presence bit for each of `count` scalar fields.
template <unsigned count>
using PresenceWord = std::conditional_t<
    count <= 8, std::uint8_t,
    std::conditional_t<count <= 16, std::uint16_t,
                       std::conditional_t<count <= 32, std::uint32_t, std::uint64_t>>>;

// The name of an enumeration's value, or empty. Most enumerations have all values from the first
// on.
constexpr Name nameOf(std::span<const EnumName> names, std::int32_t value) {
  const auto likely = static_cast<std::size_t>(std::int64_t{value} - names.front().value);
  if (likely < names.size() && names[likely].value == value) return names[likely].name;
  const auto found = std::ranges::lower_bound(names, value, {}, &EnumName::value);
  return found != names.end() && found->value == value ? found->name : Name();
}

template <class Message>
inline constexpr const auto& kFieldsOf = Message::template kFields<Message>;
template <class Message>
using FieldsOf = std::remove_cvref_t<decltype(kFieldsOf<Message>)>;

// Calls visit(field) for every row of the message's table, in field order.
template <class Message, class Visitor>
constexpr void forEachField(Visitor&& visit) {
  std::apply([&visit](const auto&... field) { (visit(field), ...); }, kFieldsOf<Message>);
}

}  // namespace qel
