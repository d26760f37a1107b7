// The dictionary form straight from the bytes, for payloads whose fields come in any order. No
// message is made on the way: one takes many times the bytes that ask for it.
#pragma once

#include <array>
#include <utility>

#include "messages/runtime/AnyOrderReader.h"
#include "messages/runtime/DictionaryReader.h"

namespace qel {

// The dictionary form of the message that the part holds; where reading stopped, damaged if the
// bytes are.
template <class Message>
Cursor readDictionaryInAnyOrder(Dictionary& dictionary, Cursor part);

// One value in place of the entries of a dictionary.
struct OneEntry {
  template <class T>
  void append(Name /*key*/, T&& read) {
    value = Value(std::forward<T>(read));
  }
  Value& value;
};

// Keeps what every field has given so far: the last value, or all elements of a list.
template <class Message>
class AnyOrderTarget {
 public:
  template <std::size_t index, class Field>
  Cursor take(Cursor cursor, const Field& field) {
    OneEntry entry{_values[index]};
    return EntriesTarget<Message, OneEntry>{entry}.template read<void>(cursor, field);
  }
  template <std::size_t index, class Nested>
  Cursor take(Cursor cursor, const MessageField<Message, Nested>& /*field*/) {
    Dictionary nested;
    cursor = readNested<Nested>(nested, cursor);
    _values[index] = std::move(nested);
    return cursor;
  }
  template <std::size_t index, class Nested>
  Cursor take(Cursor cursor, const RepeatedMessageField<Message, Nested>& /*field*/) {
    Dictionary nested;
    cursor = readNested<Nested>(nested, cursor);
    _lists[index].emplace_back(std::move(nested));
    return cursor;
  }
  template <std::size_t index, class T, Encoding encoding>
  Cursor take(Cursor cursor, const PackedField<Message, T, encoding>& /*field*/) {
    return readPacked<encoding>(_lists[index], cursor);
  }

  // Moves all of it into the dictionary, in field order.
  void giveTo(Dictionary& dictionary) {
    giveTo(dictionary, std::make_index_sequence<kFieldCount>());
  }

 private:
  static constexpr std::size_t kFieldCount = std::tuple_size_v<FieldsOf<Message>>;

  template <class Nested>
  static Cursor readNested(Dictionary& nested, Cursor cursor) {
    const Cursor part = readDelimited(cursor);
    if (part.isDamaged()) return part;
    return {readDictionaryInAnyOrder<Nested>(nested, part).at, cursor.end};
  }

  template <std::size_t... index>
  void giveTo(Dictionary& dictionary, std::index_sequence<index...>) {
    const std::size_t count = (std::size_t{isThere<index>()} + ... + 0);
    if (count == 0) return;
    Entries entries(dictionary.entries(), count);
    (give<index>(entries), ...);
  }
  template <std::size_t index>
  static constexpr bool kIsPackedField =
      kIsPacked<std::remove_cvref_t<decltype(std::get<index>(kFieldsOf<Message>))>>;
  template <std::size_t index>
  bool isThere() const {
    return kIsPackedField<index> || !_values[index].isNull() || !_lists[index].empty();
  }
  template <std::size_t index>
  void give(Entries& entries) {
    constexpr auto& field = std::get<index>(kFieldsOf<Message>);
    if (!_values[index].isNull()) {
      entries.append(field.key, std::move(_values[index]));
    } else if (isThere<index>()) {
      entries.append(field.key, std::move(_lists[index]));
    }
  }

  std::array<Value, kFieldCount> _values;  // null: not there
  std::array<List, kFieldCount> _lists;
};

template <class Message>
Cursor readDictionaryInAnyOrder(Dictionary& dictionary, Cursor part) {
  AnyOrderTarget<Message> target;
  const Cursor stopped = readInAnyOrder<Message>(target, part);
  if (!stopped.isDamaged()) target.giveTo(dictionary);
  return stopped;
}

}  // namespace qel
