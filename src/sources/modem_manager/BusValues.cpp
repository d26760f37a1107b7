#include "sources/modem_manager/BusValues.h"

#include <array>
#include <limits>

namespace qel::sources {
namespace {

template <class Type>
std::optional<std::int64_t> integerOf(const sdbus::Variant& variant) {
  const auto value = busValue<Type>(variant);
  if (!value) return std::nullopt;
  if constexpr (sizeof(Type) == sizeof(std::uint64_t) && std::numeric_limits<Type>::min() == 0) {
    if (*value > std::numeric_limits<std::int64_t>::max()) return std::nullopt;
  }
  return static_cast<std::int64_t>(*value);
}

constexpr std::array kIntegers = {
    integerOf<std::uint32_t>, integerOf<std::int32_t>, integerOf<std::uint16_t>,
    integerOf<std::int16_t>,  integerOf<std::uint8_t>, integerOf<std::uint64_t>,
    integerOf<std::int64_t>,
};

}  // namespace

std::optional<std::int64_t> busInteger(const BusProperties& properties, const std::string& key) {
  const auto found = properties.find(key);
  if (found == properties.end()) return std::nullopt;
  for (const auto read : kIntegers) {
    if (const auto value = read(found->second)) return value;
  }
  return std::nullopt;
}

std::optional<std::uint32_t> busUnsigned(const BusProperties& properties, const std::string& key) {
  const auto value = busInteger(properties, key);
  if (!value || *value < 0 || *value > std::numeric_limits<std::uint32_t>::max()) {
    return std::nullopt;
  }
  return static_cast<std::uint32_t>(*value);
}

std::optional<double> busDouble(const BusProperties& properties, const std::string& key) {
  if (const auto value = busValue<double>(properties, key)) return value;
  const auto integer = busInteger(properties, key);
  return integer ? std::optional(static_cast<double>(*integer)) : std::nullopt;
}

}  // namespace qel::sources
