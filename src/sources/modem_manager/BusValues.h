// Values from the bus, read without trust: a value of another type than expected is none.
#pragma once

#include <sdbus-c++/Types.h>

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>

namespace qel::sources {

using BusProperties = std::map<std::string, sdbus::Variant>;
using BusInterfaces = std::map<std::string, BusProperties>;

template <class Type>
std::optional<Type> busValue(const sdbus::Variant& variant) {
  if (variant.isEmpty() || !variant.containsValueOfType<Type>()) return std::nullopt;
  return variant.get<Type>();
}

template <class Type>
std::optional<Type> busValue(const BusProperties& properties, const std::string& key) {
  const auto found = properties.find(key);
  if (found == properties.end()) return std::nullopt;
  return busValue<Type>(found->second);
}

// An integer of any width that fits, so that none of them has to be the documented one.
std::optional<std::int64_t> busInteger(const BusProperties& properties, const std::string& key);
std::optional<std::uint32_t> busUnsigned(const BusProperties& properties, const std::string& key);
// A floating point number or an integer.
std::optional<double> busDouble(const BusProperties& properties, const std::string& key);

// By object path.
using BusObjects = std::map<std::string, BusInterfaces>;

// Empty when there is no such object.
inline const BusInterfaces& objectAt(const BusObjects& objects, const std::string& path) {
  static const BusInterfaces kNone;
  const auto found = objects.find(path);
  return found == objects.end() ? kNone : found->second;
}

// Empty when there is no such interface.
inline const BusProperties& propertiesOf(const BusInterfaces& interfaces, const std::string& name) {
  static const BusProperties kNone;
  const auto found = interfaces.find(name);
  return found == interfaces.end() ? kNone : found->second;
}

}  // namespace qel::sources
