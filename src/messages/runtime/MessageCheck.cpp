#include "messages/runtime/MessageCheck.h"

#include "messages/runtime/AnyOrderReader.h"

namespace qel {
namespace {

// Apart, so that the usual way keeps nothing in memory.
[[gnu::noinline]] Cursor checkRest(const MessagePlan& plan, Cursor rest) {
  return readInAnyOrder(plan, rest, [&plan](Cursor cursor, std::size_t place) {
    return pastValue(plan.fields.data()[place], cursor);
  });
}

}  // namespace

// By the field's own kind, whatever the wire type.
Cursor pastValue(const FieldPlan& field, Cursor cursor) {
  using Kind = FieldPlan::Kind;
  if (field.isVarint()) return {readVarint(cursor).next, cursor.end};
  Cursor part = readDelimited(cursor);
  if (part.isDamaged()) return part;
  if (field.kind == Kind::delimited) return {part.end, cursor.end};
  if (field.kind == Kind::message) return {checkMessage(*field.nested, part).at, cursor.end};
  while (!part.isAtEnd()) part.at = readVarint(part).next;
  return {part.at, cursor.end};
}

// Nearly all fields are known, with a tag of one byte.
Cursor checkMessage(const MessagePlan& plan, Cursor part) {
  while (!part.isAtEnd()) {
    const std::uint8_t tag = *part.at;
    if (tag >= 0x80 || isEndOfGroup(tag)) return checkRest(plan, part);
    const std::uint8_t place = plan.placeOf[tag >> 3];
    if (place == MessagePlan::kNone) return checkRest(plan, part);
    part = pastValue(plan.fields.data()[place], {part.at + 1, part.end});
  }
  return part;
}

}  // namespace qel
