// Reading fields in whatever order they come.
#pragma once

#include <cstdint>

#include "messages/runtime/FieldOrder.h"
#include "messages/runtime/MessagePlan.h"

namespace qel {

// The number is cut to sixteen bits.
constexpr std::uint16_t numberOfTag(std::uint64_t tag) {
  return static_cast<std::uint16_t>(tag >> 3);
}
constexpr bool isEndOfGroup(std::uint64_t tag) { return (tag & 7) == 4; }

// Which field of the message the tag is of; kNone where it is of no field.
[[gnu::always_inline]] inline std::uint8_t placeOf(const MessagePlan& plan, std::uint64_t tag) {
  return isEndOfGroup(tag) ? MessagePlan::kNone : plan.find(numberOfTag(tag));
}

// Goes past what is no field of the message: unknown fields, and metric identifiers, which are
// logged. Stops at the tag of a field, or where reading is over, with nothing left then.
Cursor pastOthers(const MessagePlan& plan, Cursor cursor);

// Goes through the bytes and calls take(cursor, place), which reads the value, for every field of
// the message. Where reading stopped, with nothing left; damaged if the bytes are.
template <class Take>
[[gnu::always_inline]] inline Cursor readInAnyOrder(const MessagePlan& plan, Cursor cursor,
                                                    Take&& take) {
  while (!cursor.isAtEnd()) {
    const auto [tag, next] = readVarintHere(cursor);
    const std::uint8_t place = placeOf(plan, tag);
    if (place == MessagePlan::kNone) [[unlikely]] {
      cursor = pastOthers(plan, cursor);
    } else {
      cursor = take(Cursor{next, cursor.end}, place);
    }
  }
  return cursor;
}

}  // namespace qel
