#include "messages/runtime/MessageCheck.h"

#include "messages/runtime/AnyOrderReader.h"

namespace qel {
namespace {

// Goes past the value of a field by the field's own kind.
Cursor pastValue(const FieldPlan& field, Cursor cursor) {
  using Kind = FieldPlan::Kind;
  if (field.kind == Kind::varint) return {readVarint(cursor).next, cursor.end};
  Cursor part = readDelimited(cursor);
  if (part.isDamaged()) return part;
  if (field.kind == Kind::delimited) return {part.end, cursor.end};
  if (field.kind == Kind::message) return {checkMessage(*field.nested, part).at, cursor.end};
  while (!part.isAtEnd()) part.at = readVarint(part).next;
  return {part.at, cursor.end};
}

// Nearly all tags are known and of one byte: they can be told by a look.
bool isKnownTag(const MessagePlan& plan, std::uint8_t first) {
  constexpr std::uint8_t kEndOfGroup = 4;
  return first < 0x80 && (first & 7) != kEndOfGroup &&
         plan.placeOf[first >> 3] != MessagePlan::kNone;
}

Cursor pastKnownFields(const MessagePlan& plan, Cursor cursor) {
  while (!cursor.isAtEnd() && isKnownTag(plan, *cursor.at)) {
    const FieldPlan& field = plan.fields[plan.placeOf[*cursor.at >> 3]];
    cursor = pastValue(field, {cursor.at + 1, cursor.end});
  }
  return cursor;
}

}  // namespace

Cursor checkMessage(const MessagePlan& plan, Cursor part) {
  part = pastKnownFields(plan, part);
  return readInAnyOrder(plan, part, [&plan](Cursor cursor, std::size_t place) {
    return pastKnownFields(plan, pastValue(plan.fields[place], cursor));
  });
}

}  // namespace qel
