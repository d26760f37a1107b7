#include "messages/runtime/DictionaryReader.h"

namespace qel {

Cursor readSpread(Dictionary::Entries::Spread& entries, const FieldPlan& field, std::size_t place,
                  Cursor cursor) {
  auto& [key, value] =
      entries.has(place) ? entries[place] : entries.make(place, field.key, Value());
  cursor = field.read(value, cursor, field);
  entries.note(place);
  return cursor;
}

Cursor readName(Value& value, Cursor cursor, const FieldPlan& field) {
  const auto [varint, next] = readVarint(cursor);
  value = nameRead(field.names, varint);
  return {next, cursor.end};
}

Cursor readBytes(Value& value, Cursor cursor, const FieldPlan& /*field*/) {
  const Cursor data = readDelimited(cursor);
  if (data.isDamaged()) return data;
  value = Bytes(data.at, data.end);
  return {data.end, cursor.end};
}

Cursor readText(Value& value, Cursor cursor, const FieldPlan& /*field*/) {
  const Cursor text = readDelimited(cursor);
  if (text.isDamaged()) return text;
  value = std::string_view(reinterpret_cast<const char*>(text.at), text.left());
  return {text.end, cursor.end};
}

}  // namespace qel
