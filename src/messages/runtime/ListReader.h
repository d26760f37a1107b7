// The messages of one list in a payload, without the message around them.
#pragma once

#include <type_traits>
#include <utility>

#include "messages/runtime/DictionaryReader.h"
#include "messages/runtime/MessageCheck.h"
#include "messages/runtime/MessageReader.h"

namespace qel {

// Takes the entries of the one list of such messages that the class has.
template <class Message, class Nested, class Take>
struct ListTarget {
  using ListField = RepeatedMessageField<Message, Nested>;
  static constexpr bool kStopsAtEnd = true;

  template <std::size_t index, class Field>
  void set(const Field& /*field*/, std::uint64_t /*varint*/) {}
  template <class Tag, std::size_t index, class Field>
  Cursor read(Cursor cursor, const Field& /*field*/) {
    if constexpr (!std::is_same_v<Field, ListField>) {
      return pastValue(PlanOf<Message>::kFields[index], cursor);
    } else {
      for (;; cursor = Tag::behind(cursor)) {
        cursor = readEntry(cursor);
        if (cursor.isAtEnd() || !Tag::standsAt(cursor)) return cursor;
      }
    }
  }
  template <std::size_t index, class Field>
  void leaveOut(const Field& /*field*/) {}

  Cursor readEntry(Cursor cursor) {
    Nested entry;
    cursor = readNested(entry, cursor);
    take(std::as_const(entry));
    return cursor;
  }

  Take& take;
};

// Calls take(const Nested&) for each entry; it is gone after the call. False where there would be
// no message: what was taken then counts for nothing.
template <class Message, class Nested, class Take>
bool readList(ByteView bytes, Take&& take) {
  using Target = ListTarget<Message, Nested, Take>;
  constexpr const MessagePlan& plan = PlanOf<Message>::kPlan;
  constexpr auto list = std::get<typename Target::ListField>(kFieldsOf<Message>).number;
  Target target{take};
  const Cursor whole{bytes.data(), bytes.data() + bytes.size()};
  const Cursor rest = readInOrder<Message>(target, whole);
  const auto read = [&target](Cursor cursor, std::size_t place) {
    const bool isList = place == plan.find(list);
    return isList ? target.readEntry(cursor) : pastValue(plan.fields.data()[place], cursor);
  };
  return !readInAnyOrder(plan, rest, read).isDamaged();
}

}  // namespace qel
