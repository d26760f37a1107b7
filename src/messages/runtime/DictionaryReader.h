// The dictionary form straight from the bytes, for payloads whose fields come in order.
#pragma once

#include <string_view>

#include "messages/runtime/FieldOrder.h"
#include "messages/runtime/MessageDictionary.h"

namespace qel {

// The dictionary form of the message that the part holds. Damaged when it is not as it would be
// written (fields out of order or several times, unknown ones, damaged bytes): what that means is
// for the reader of any order to say.
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
[[gnu::always_inline]] inline void reserveEntries(Dictionary::Entries& entries, Cursor part) {
  constexpr std::size_t kFieldCount = std::tuple_size_v<FieldsOf<Message>>;
  if (part.left() >= kFieldCount) [[likely]] {
    entries.reserve(kFieldCount);
  } else {
    entries.reserve(part.left() / 2 + 1 + kPackedFieldsOf<Message>);
  }
}

template <Encoding encoding>
Cursor readPacked(List& list, Cursor cursor) {
  Cursor run = readDelimited(cursor);
  while (!run.isAtEnd()) {
    const auto [value, next] = readVarint(run);
    list.emplace_back(decodedScalar<encoding>(value));
    run.at = next;
  }
  return {run.at, cursor.end};
}

// Takes fields in order as entries of a dictionary.
template <class Message, class Sink = Entries>
struct EntriesTarget {
  // An absent packed field has an empty list.
  static constexpr bool kStopsAtEnd = kPackedFieldsOf<Message> == 0;

  template <class Tag, class T, Encoding encoding>
  [[gnu::always_inline]] Cursor read(Cursor cursor,
                                     const ScalarField<Message, T, encoding>& field) {
    const auto [value, next] = readVarint(cursor);
    entries.append(field.key, decodedScalar<encoding>(value));
    return {next, cursor.end};
  }

  template <class Tag>
  Cursor read(Cursor cursor, const EnumField<Message>& field) {
    const auto [value, next] = readVarint(cursor);
    entries.append(field.key, enumText(field.names, decodedScalar<Encoding::int32>(value)));
    return {next, cursor.end};
  }

  template <class Tag>
  Cursor read(Cursor cursor, const DataField<Message>& field) {
    const Cursor data = readDelimited(cursor);
    if (data.isDamaged()) return data;
    entries.append(field.key, Bytes(data.at, data.end));
    return {data.end, cursor.end};
  }

  template <class Tag>
  Cursor read(Cursor cursor, const StringField<Message>& field) {
    const Cursor text = readDelimited(cursor);
    if (text.isDamaged()) return text;
    entries.append(field.key,
                   std::string_view(reinterpret_cast<const char*>(text.at), text.left()));
    return {text.end, cursor.end};
  }

  template <class Tag, class Nested>
  Cursor read(Cursor cursor, const MessageField<Message, Nested>& field) {
    Dictionary nested;
    cursor = readNestedDictionary<Nested>(nested, cursor);
    entries.append(field.key, std::move(nested));
    return cursor;
  }

  template <class Tag, class Nested>
  Cursor read(Cursor cursor, const RepeatedMessageField<Message, Nested>& field) {
    List list;
    reserveUsual(list, cursor);
    cursor = readNestedDictionary<Nested>(list, cursor);
    while (!cursor.isAtEnd() && Tag::standsAt(cursor)) {
      cursor = readNestedDictionary<Nested>(list, Tag::behind(cursor));
    }
    entries.append(field.key, std::move(list));
    return cursor;
  }

  template <class Tag, class T, Encoding encoding>
  Cursor read(Cursor cursor, const PackedField<Message, T, encoding>& field) {
    List list;
    cursor = readPacked<encoding>(list, cursor);
    entries.append(field.key, std::move(list));
    return cursor;
  }

  template <class Field>
  void leaveOut(const Field& field) {
    if constexpr (kIsPacked<Field>) entries.append(field.key, List());
  }

  template <class Nested>
  static Cursor readNestedDictionary(Dictionary& nested, Cursor cursor) {
    const Cursor part = readDelimited(cursor);
    if (part.isDamaged()) return part;
    return {readDictionary<Nested>(nested, part).at, cursor.end};
  }
  template <class Nested>
  static Cursor readNestedDictionary(List& list, Cursor cursor) {
    Dictionary nested;
    cursor = readNestedDictionary<Nested>(nested, cursor);
    list.emplace_back(std::move(nested));
    return cursor;
  }

  Sink& entries;
};

template <class Message>
Cursor readDictionary(Dictionary& dictionary, Cursor part) {
  if (EntriesTarget<Message>::kStopsAtEnd && part.isAtEnd()) return part;
  reserveEntries<Message>(dictionary.entries(), part);
  Entries entries(dictionary.entries(), 0);
  EntriesTarget<Message> target{entries};
  const Cursor stopped = readInOrder<Message>(target, part);
  return stopped.at == part.end ? stopped : Cursor::damaged();
}

}  // namespace qel
