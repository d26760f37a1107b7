#include "messages/runtime/DictionaryReader.h"

namespace qel {
namespace {

// Calls take with what the varint of a number stands for.
template <class Take>
[[gnu::always_inline]] inline void takeNumber(Encoding encoding, std::uint64_t varint,
                                              Take&& take) {
  switch (encoding) {
    case Encoding::uint64:
      return take(decodedScalar<Encoding::uint64>(varint));
    case Encoding::uint32:
      return take(decodedScalar<Encoding::uint32>(varint));
    case Encoding::int32:
      return take(decodedScalar<Encoding::int32>(varint));
    case Encoding::sint32:
      return take(decodedScalar<Encoding::sint32>(varint));
    case Encoding::boolean:
      return take(decodedScalar<Encoding::boolean>(varint));
  }
}

}  // namespace

Cursor readRestOfDictionary(Dictionary& dictionary, const MessagePlan& plan, std::uint64_t places,
                            Cursor rest) {
  if (placeOf(plan, readVarintHere(rest).value) == MessagePlan::kNone) {
    rest = pastOthers(plan, rest);
    if (rest.isAtEnd()) return rest;
  }
  Dictionary::Entries::Spread entries(dictionary.entries(), plan.fields.size(), places);
  return readInAnyOrder(plan, rest, [&](Cursor cursor, std::size_t place) {
    const FieldPlan& field = plan.fields.data()[place];
    if (!field.isVarint()) {
      if (!entries.has(place)) entries.make(place, field.key, Value());
      return field.read(entries[place].value, cursor, field);
    }
    const auto [varint, next] = readVarint(cursor);
    const auto make = [&](auto value) { entries.make(place, field.key, std::move(value)); };
    if (field.kind == FieldPlan::Kind::name) {
      make(nameRead(field.names, varint));
    } else {
      takeNumber(field.encoding, varint, make);
    }
    return Cursor{next, cursor.end};
  });
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
