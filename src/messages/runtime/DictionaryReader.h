// The dictionary form straight from the bytes, for payloads whose fields come in order.
#pragma once

#include <string_view>

#include "messages/runtime/FieldOrder.h"
#include "messages/runtime/MessageDictionary.h"

namespace qel {

// The dictionary form of the message that the part holds. Damaged when it is not as it would be
// written (fields out of order or several times, unknown ones, damaged bytes): what that means is
// for the message reader to say.
template <class Message>
Cursor readDictionary(Dictionary& dictionary, Cursor part);

template <class Message>
inline constexpr bool kHasPackedField = false;
template <class... Field>
inline constexpr bool kHasPackedField<std::tuple<Field...>> = (kIsPacked<Field> || ...);

// Takes fields in order as entries of a dictionary.
template <class Message>
struct EntriesTarget {
  // An absent packed field has an empty list.
  static constexpr bool kStopsAtEnd =
      !kHasPackedField<std::remove_cv_t<decltype(Message::kFields)>>;

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
    list.reserve(kUsualCount);
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
    Cursor run = readDelimited(cursor);
    while (!run.isAtEnd()) {
      const auto [value, next] = readVarint(run);
      list.emplace_back(decodedScalar<encoding>(value));
      run.at = next;
    }
    entries.append(field.key, std::move(list));
    return {run.at, cursor.end};
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

  Entries& entries;
};

template <class Message>
Cursor readDictionary(Dictionary& dictionary, Cursor part) {
  Entries entries(dictionary.entries(), std::tuple_size_v<decltype(Message::kFields)>);
  EntriesTarget<Message> target{entries};
  const Cursor stopped = readInOrder<Message>(target, part);
  return stopped.at == part.end ? stopped : Cursor::damaged();
}

}  // namespace qel
