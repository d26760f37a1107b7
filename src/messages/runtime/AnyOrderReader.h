// Reading fields in whatever order they come.
#pragma once

#include <cstdint>

#include "messages/runtime/FieldOrder.h"
#include "messages/runtime/MessagePlan.h"

namespace qel {

// A field of the message, and where its value stands.
struct FoundField {
  std::uint8_t place;  // in the plan; kNone: there is none, and reading is over at the cursor
  Cursor cursor;
};

// Goes past what is no field of the message: unknown fields, and metric identifiers, which are
// logged.
FoundField findField(const MessagePlan& plan, Cursor cursor);

// Goes through the bytes and calls take(cursor, place), which reads the value, for every field of
// the message. Where reading stopped, damaged if the bytes are.
template <class Take>
[[gnu::always_inline]] inline Cursor readInAnyOrder(const MessagePlan& plan, Cursor cursor,
                                                    Take&& take) {
  while (!cursor.isAtEnd()) {
    const FoundField found = findField(plan, cursor);
    if (found.place == MessagePlan::kNone) return found.cursor;
    cursor = take(found.cursor, found.place);
  }
  return cursor;
}

}  // namespace qel
