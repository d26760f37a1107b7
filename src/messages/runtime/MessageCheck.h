// Whether bytes are a message, without making one.
#pragma once

#include "messages/runtime/AnyOrderReader.h"

namespace qel {

// Where reading stops, damaged if the bytes are: as the message reader says, and logging what it
// logs.
template <class Message>
Cursor checkMessage(Cursor part);

// Goes past the value of every field by the field's own kind.
template <class Message>
struct CheckTarget {
  template <std::size_t index, class T, Encoding encoding>
  Cursor take(Cursor cursor, const ScalarField<Message, T, encoding>& /*field*/) {
    return {readVarint(cursor).next, cursor.end};
  }
  template <std::size_t index>
  Cursor take(Cursor cursor, const EnumField<Message>& /*field*/) {
    return {readVarint(cursor).next, cursor.end};
  }
  template <std::size_t index>
  Cursor take(Cursor cursor, const DataField<Message>& /*field*/) {
    return pastDelimited(cursor);
  }
  template <std::size_t index>
  Cursor take(Cursor cursor, const StringField<Message>& /*field*/) {
    return pastDelimited(cursor);
  }
  template <std::size_t index, class Nested>
  Cursor take(Cursor cursor, const MessageField<Message, Nested>& /*field*/) {
    return pastNested<Nested>(cursor);
  }
  template <std::size_t index, class Nested>
  Cursor take(Cursor cursor, const RepeatedMessageField<Message, Nested>& /*field*/) {
    return pastNested<Nested>(cursor);
  }
  template <std::size_t index, class T, Encoding encoding>
  Cursor take(Cursor cursor, const PackedField<Message, T, encoding>& /*field*/) {
    Cursor run = readDelimited(cursor);
    while (!run.isAtEnd()) run.at = readVarint(run).next;
    return {run.at, cursor.end};
  }

 private:
  static Cursor pastDelimited(Cursor cursor) {
    const Cursor part = readDelimited(cursor);
    return part.isDamaged() ? part : Cursor{part.end, cursor.end};
  }
  template <class Nested>
  static Cursor pastNested(Cursor cursor) {
    const Cursor part = readDelimited(cursor);
    if (part.isDamaged()) return part;
    return {checkMessage<Nested>(part).at, cursor.end};
  }
};

template <class Message>
Cursor checkMessage(Cursor part) {
  CheckTarget<Message> target;
  return readInAnyOrder<Message>(target, part);
}

}  // namespace qel
