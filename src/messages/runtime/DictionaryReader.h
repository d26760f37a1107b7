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

// One for each kind of field: what stands behind the tag, as a value of its own or, for lists, at
// the end of the one that is there.
template <Encoding encoding>
Cursor readNumber(Value& value, Cursor cursor, const FieldPlan& /*field*/) {
  const auto [varint, next] = readVarint(cursor);
  value = decodedScalar<encoding>(varint);
  return {next, cursor.end};
}
inline Text nameRead(std::span<const EnumName> names, std::uint64_t varint) {
  return enumText(names, decodedScalar<Encoding::int32>(varint));
}
// The same into an entry in its place.
Cursor readSpread(Dictionary::Entries::Spread& entries, const FieldPlan& field, std::size_t place,
                  Cursor cursor);
Cursor readName(Value& value, Cursor cursor, const FieldPlan& field);
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
  return readElement<Nested>(value.growingList(), cursor);
}

template <class Message, class T, Encoding encoding>
constexpr FieldPlan planOfField(const ScalarField<Message, T, encoding>& field) {
  return {field.number, FieldPlan::Kind::varint, field.key, readNumber<encoding>};
}
template <class Message>
constexpr FieldPlan planOfField(const EnumField<Message>& field) {
  return {field.number, FieldPlan::Kind::varint, field.key, readName, field.names};
}
template <class Message>
constexpr FieldPlan planOfField(const DataField<Message>& field) {
  return {field.number, FieldPlan::Kind::delimited, field.key, readBytes};
}
template <class Message>
constexpr FieldPlan planOfField(const StringField<Message>& field) {
  return {field.number, FieldPlan::Kind::delimited, field.key, readText};
}
template <class Message, class Nested>
constexpr FieldPlan planOfField(const MessageField<Message, Nested>& field) {
  return {field.number, FieldPlan::Kind::message, field.key, readOne<Nested>,
          {},           &PlanOf<Nested>::kPlan};
}
template <class Message, class Nested>
constexpr FieldPlan planOfField(const RepeatedMessageField<Message, Nested>& field) {
  return {field.number, FieldPlan::Kind::message, field.key, readOneMore<Nested>,
          {},           &PlanOf<Nested>::kPlan};
}
template <class Message, class T, Encoding encoding>
constexpr FieldPlan planOfField(const PackedField<Message, T, encoding>& field) {
  return {field.number, FieldPlan::Kind::packed, field.key, readNumbers<encoding>};
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

// Takes fields as they come, to entries in places of their own.
template <class Message>
struct SpreadTarget {
  static constexpr bool kStopsAtEnd = true;

  template <std::size_t index, class T, Encoding encoding>
  void set(const ScalarField<Message, T, encoding>& field, std::uint64_t varint) {
    put<index>(field.key, decodedScalar<encoding>(varint));
  }
  template <std::size_t index>
  void set(const EnumField<Message>& field, std::uint64_t varint) {
    put<index>(field.key, nameRead(field.names, varint));
  }
  template <class Tag, std::size_t index, class Field>
  [[gnu::always_inline]] Cursor read(Cursor cursor, const Field& /*field*/) {
    return readAt(index, cursor);
  }
  template <std::size_t index, class Field>
  void leaveOut(const Field&) {}

  template <std::size_t index, class T>
  [[gnu::always_inline]] void put(Name key, T&& value) {
    if (!entries.has(index)) {
      entries.make(index, key, std::forward<T>(value));
    } else {
      entries[index].value = Value(std::forward<T>(value));
      entries.note(index);
    }
  }
  Cursor readAt(std::size_t place, Cursor cursor) {
    return readSpread(entries, PlanOf<Message>::kFields[place], place, cursor);
  }

  Dictionary::Entries::Spread& entries;
};

// Reads on where fields are no longer as they would be written: in another order, several times,
// or unknown. `places` are those of the entries that are there. Apart from readDictionary, which
// then needs nothing in memory.
template <class Message>
[[gnu::noinline]] Cursor readRestOfDictionary(Dictionary& dictionary, std::uint64_t places,
                                              Cursor rest) {
  FoundField found = findField(PlanOf<Message>::kPlan, rest);
  if (found.place == MessagePlan::kNone) return found.cursor;
  Dictionary::Entries::Spread entries(dictionary.entries(), PlanOf<Message>::kFields.size(),
                                      places);
  SpreadTarget<Message> target{entries};
  for (;;) {
    Cursor cursor = target.readAt(found.place, found.cursor);
    for (const std::uint8_t* before = nullptr; before != cursor.at && !cursor.isAtEnd();) {
      before = cursor.at;
      cursor = readInOrder<Message>(target, cursor);
    }
    found = findField(PlanOf<Message>::kPlan, cursor);
    if (found.place == MessagePlan::kNone) return found.cursor;
  }
}

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
  return readRestOfDictionary<Message>(dictionary, places, part);
}

}  // namespace qel
