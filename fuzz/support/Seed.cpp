#include "fuzz/support/Seed.h"

#include <algorithm>
#include <bit>

#include "fuzz/support/Input.h"

namespace qel::fuzz {

Seed& Seed::rest(ByteView content) {
  bytes.insert(bytes.end(), content.begin(), content.end());
  return *this;
}

Seed& Seed::piece(ByteView content) {
  return number(static_cast<std::uint16_t>(content.size())).rest(content);
}

Seed& Seed::text(std::string_view content) {
  return piece({reinterpret_cast<const std::uint8_t*>(content.data()), content.size()});
}

Seed& Seed::key(std::string_view key) {
  const auto usual = usualKeys();
  const auto place = static_cast<std::size_t>(std::ranges::find(usual, key) - usual.begin());
  byte(place);
  return place < usual.size() ? *this : text(key);
}

Seed& Seed::value(const Value& value) {
  byte(static_cast<std::size_t>(value.kind()));
  if (const auto boolean = value.asBoolean()) return byte(*boolean ? 1 : 0);
  if (value.kind() == Value::Kind::floating)
    return number(std::bit_cast<std::uint32_t>(*value.asFloat()));
  if (const auto integer = value.asInt64()) return number(static_cast<std::uint64_t>(*integer));
  if (const auto integer = value.asUInt64()) return number(*integer);
  if (const auto content = value.asText()) return text(*content);
  if (const Bytes* content = value.asBytes()) return piece(*content);
  if (const Dictionary* below = value.asDictionary()) return entries(*below);
  if (const List* list = value.asList()) {
    byte(list->size());
    for (const Value& element : *list) this->value(element);
  }
  return *this;
}

Seed& Seed::entries(const Dictionary& entries) {
  byte(entries.size());
  for (const auto& [entryKey, entryValue] : entries) key(entryKey.view()).value(entryValue);
  return *this;
}

}  // namespace qel::fuzz
