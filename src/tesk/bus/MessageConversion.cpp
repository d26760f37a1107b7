#include "tesk/bus/MessageConversion.h"

#include <cstdint>
#include <optional>
#include <vector>

namespace tesk::bus {
namespace {

using qel::Value;
using BusBytes = std::vector<std::uint8_t>;  // as the bus library knows them

std::optional<sdbus::Variant> variantOf(const Value& value) {
  if (const auto boolean = value.asBoolean()) return sdbus::Variant(*boolean);
  if (value.kind() == Value::Kind::floating) return std::nullopt;
  if (const auto integer = value.asInt64()) return sdbus::Variant(*integer);
  if (const auto text = value.asText()) return sdbus::Variant(std::string(*text));
  if (const qel::Bytes* data = value.asBytes()) {
    return sdbus::Variant(BusBytes(data->begin(), data->end()));
  }
  return std::nullopt;
}

template <class Held>
bool take(const sdbus::Variant& variant, Value& value) {
  if (!variant.containsValueOfType<Held>()) return false;
  value = Value(variant.get<Held>());
  return true;
}

template <>
bool take<BusBytes>(const sdbus::Variant& variant, Value& value) {
  if (!variant.containsValueOfType<BusBytes>()) return false;
  const BusBytes bytes = variant.get<BusBytes>();
  value = Value(qel::Bytes(bytes.begin(), bytes.end()));
  return true;
}

template <class... Held>
Value firstOf(const sdbus::Variant& variant) {
  Value value;
  (take<Held>(variant, value) || ...);
  return value;
}

}  // namespace

VariantMap toVariants(const Message& message) {
  VariantMap variants;
  for (const auto& [key, value] : message.entries()) {
    if (auto variant = variantOf(value)) {
      variants.insert_or_assign(std::string(key.view()), std::move(*variant));
    }
  }
  return variants;
}

Message fromVariants(const VariantMap& variants) {
  qel::Dictionary entries;
  for (const auto& [key, variant] : variants) {
    entries.set(key, firstOf<std::int64_t, std::uint64_t, std::int32_t, std::uint32_t, std::int16_t,
                             std::uint16_t, std::uint8_t, bool, std::string, BusBytes>(variant));
  }
  return Message(std::move(entries));
}

}  // namespace tesk::bus
