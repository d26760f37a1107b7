// The dictionary form straight from the bytes. No message is made on the way: one takes many times
// the bytes that ask for it.
#pragma once

#include <array>
#include <string_view>
#include <tuple>
#include <utility>

#include "messages/runtime/AnyOrderReader.h"
#include "messages/runtime/FieldOrder.h"
#include "messages/runtime/MessageDictionary.h"
#include "messages/runtime/MessagePlan.h"

namespace qel {

// The dictionary form of the message that the part holds; where reading stopped, damaged if the
// bytes are.
template <class Message>
Cursor readDictionary(Dictionary& dictionary, Cursor part);

template <class Fields>
inline constexpr std::size_t kPackedFields = 0;
template <class... Field>
inline constexpr std::size_t kPackedFields<std::tuple<Field...>> = (std::size_t{kIsPacked<Field>} +
                                                                    ... + 0);
template <class Message>
inline constexpr std::size_t kPackedFieldsOf = kPackedFields<FieldsOf<Message>>;

// Makes room for the entries of a part. Each takes a tag and a value, but for a last one whose
// value is not there, and for packed fields: where the part is short there is room for no more than
// that, which keeps memory in proportion to the input.
template <class Message>
[[gnu::always_inline]] inline Entries roomFor(Dictionary::Entries& entries, Cursor part) {
  constexpr std::size_t kFieldCount = std::tuple_size_v<FieldsOf<Message>>;
  if (part.left() >= kFieldCount) [[likely]] {
    entries.start(kFieldCount);
  } else {
    entries.reserve(part.left() / 2 + 1 + kPackedFieldsOf<Message>);
  }
  return Entries(entries);
}

template <class Nested>
[[gnu::always_inline]] inline Cursor readNestedDictionary(Dictionary& nested, Cursor cursor) {
  const Cursor part = readDelimited(cursor);
  if (part.isDamaged()) return part;
  return {readDictionary<Nested>(nested, part).at, cursor.end};
}

template <class Nested>
[[gnu::always_inline]] inline Cursor readElement(List& list, Cursor cursor) {
  return readNestedDictionary<Nested>(list.addToChange(Dictionary()).growingDictionary(), cursor);
}

inline Text nameRead(std::span<const EnumName> names, std::uint64_t varint) {
  return enumText(names, decodedScalar<Encoding::int32>(varint));
}

// One for each kind of field that is no varint: what stands behind the tag, as a value of its own
// or, for lists, at the end of the one that is there.
Cursor readBytes(Value& value, Cursor cursor, const FieldPlan& field);
Cursor readText(Value& value, Cursor cursor, const FieldPlan& field);

template <Encoding encoding>
Cursor readNumbers(Value& value, Cursor cursor, const FieldPlan& /*field*/) {
  List& list = value.growingList();
  Cursor run = readDelimited(cursor);
  while (!run.isAtEnd()) {
    const auto [varint, next] = readVarint(run);
    list.emplace_back(decodedScalar<encoding>(varint));
    run.at = next;
  }
  return {run.at, cursor.end};
}
template <class Nested>
Cursor readOne(Value& value, Cursor cursor, const FieldPlan& /*field*/) {
  value = Dictionary();
  return readNestedDictionary<Nested>(value.growingDictionary(), cursor);
}
template <class Nested>
Cursor readOneMore(Value& value, Cursor cursor, const FieldPlan& /*field*/) {
  List& list = value.growingList();
  if (list.capacity() == 0) reserveUsual(list, cursor);
  return readElement<Nested>(list, cursor);
}

template <class Message, class T, Encoding encoding>
constexpr FieldPlan planOfField(const ScalarField<Message, T, encoding>& field) {
  return {.number = field.number,
          .kind = FieldPlan::Kind::number,
          .encoding = encoding,
          .key = field.key};
}
template <class Message>
constexpr FieldPlan planOfField(const EnumField<Message>& field) {
  return {.number = field.number,
          .kind = FieldPlan::Kind::name,
          .key = field.key,
          .names = field.names};
}
template <class Message>
constexpr FieldPlan planOfField(const DataField<Message>& field) {
  return {.number = field.number,
          .kind = FieldPlan::Kind::delimited,
          .key = field.key,
          .read = readBytes};
}
template <class Message>
constexpr FieldPlan planOfField(const StringField<Message>& field) {
  return {.number = field.number,
          .kind = FieldPlan::Kind::delimited,
          .key = field.key,
          .read = readText};
}
template <class Message, class Nested>
constexpr FieldPlan planOfField(const MessageField<Message, Nested>& field) {
  return {.number = field.number,
          .kind = FieldPlan::Kind::message,
          .key = field.key,
          .read = readOne<Nested>,
          .nested = &PlanOf<Nested>::kPlan};
}
template <class Message, class Nested>
constexpr FieldPlan planOfField(const RepeatedMessageField<Message, Nested>& field) {
  return {.number = field.number,
          .kind = FieldPlan::Kind::message,
          .key = field.key,
          .read = readOneMore<Nested>,
          .nested = &PlanOf<Nested>::kPlan};
}
template <class Message, class T, Encoding encoding>
constexpr FieldPlan planOfField(const PackedField<Message, T, encoding>& field) {
  return {.number = field.number,
          .kind = FieldPlan::Kind::packed,
          .key = field.key,
          .read = readNumbers<encoding>};
}

template <class Message>
struct PlanOf {
  static constexpr auto kFields = std::apply(
      [](const auto&... field) { return std::array{planOfField(field)...}; }, kFieldsOf<Message>);
  static constexpr MessagePlan kPlan{Message::kClassName, kFields};
};

// Takes fields in order as entries of a dictionary.
template <class Message>
struct EntriesTarget {
  // An absent packed field has an empty list.
  static constexpr bool kStopsAtEnd = kPackedFieldsOf<Message> == 0;

  template <std::size_t index, class T, Encoding encoding>
  [[gnu::always_inline]] void set(const ScalarField<Message, T, encoding>& field,
                                  std::uint64_t varint) {
    append<index>(field.key, decodedScalar<encoding>(varint));
  }
  template <std::size_t index>
  void set(const EnumField<Message>& field, std::uint64_t varint) {
    append<index>(field.key, nameRead(field.names, varint));
  }

  template <class Tag, std::size_t index, class Field>
  Cursor read(Cursor cursor, const Field& field) {
    constexpr const FieldPlan& plan = PlanOf<Message>::kFields[index];
    Value value;
    cursor = plan.read(value, cursor, plan);
    append<index>(field.key, std::move(value));
    return cursor;
  }
  template <class Tag, std::size_t index, class Nested>
  Cursor read(Cursor cursor, const RepeatedMessageField<Message, Nested>& field) {
    List list;
    reserveUsual(list, cursor);
    for (;; cursor = Tag::behind(cursor)) {
      cursor = readElement<Nested>(list, cursor);
      if (cursor.isAtEnd() || !Tag::standsAt(cursor)) break;
    }
    append<index>(field.key, std::move(list));
    return cursor;
  }

  template <std::size_t index, class Field>
  void leaveOut(const Field& field) {
    if constexpr (kIsPacked<Field>) append<index>(field.key, List());
  }

  template <std::size_t index, class T>
  [[gnu::always_inline]] void append(Name key, T&& value) {
    entries.append(key, std::forward<T>(value));
    places |= std::uint64_t{1} << index;
  }

  Entries& entries;
  std::uint64_t places = 0;  // of the entries, in the plan
};

// Reads on where fields are no longer as they would be written: in another order, several times,
// or unknown. `places` are those of the entries that are there; at least one byte is left.
Cursor readRestOfDictionary(Dictionary& dictionary, const MessagePlan& plan, std::uint64_t places,
                            Cursor rest);

template <class Message>
Cursor readDictionary(Dictionary& dictionary, Cursor part) {
  if (EntriesTarget<Message>::kStopsAtEnd && part.isAtEnd()) return part;
  std::uint64_t places = 0;
  {
    Entries entries = roomFor<Message>(dictionary.entries(), part);
    EntriesTarget<Message> target{entries};
    part = readInOrder<Message>(target, part);
    places = target.places;
  }
  if (part.isAtEnd()) [[likely]]
    return part;
  return readRestOfDictionary(dictionary, PlanOf<Message>::kPlan, places, part);
}

}  // namespace qel
