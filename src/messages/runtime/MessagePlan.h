// What the fields of a class are on the wire and in a dictionary, as data: for reading that would
// not gain from code made for each class.
#pragma once

#include <array>
#include <cstdint>
#include <span>
#include <string_view>

#include "base/Value.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/runtime/Cursor.h"
#include "messages/runtime/Fields.h"

namespace qel {

struct MessagePlan;

struct FieldPlan {
  enum class Kind : std::uint8_t { number, name, delimited, packed, message };

  std::uint32_t number;
  Kind kind;
  Encoding encoding = Encoding::uint64;  // of a number
  Name key;
  // Reads the value of the entry behind the tag, where that is no varint. What the field gave
  // before is there, or null.
  Cursor (*read)(Value& value, Cursor cursor, const FieldPlan& field) = nullptr;
  std::span<const EnumName> names = {};  // of an enumeration
  const MessagePlan* nested = nullptr;   // of a message or a list of them

  bool isVarint() const { return kind <= Kind::name; }
};

// Constant.
struct MessagePlan {
  static constexpr std::size_t kNumbers = 64;  // all field numbers are below
  static constexpr std::uint8_t kNone = 0xFF;

  std::string_view className;
  std::span<const FieldPlan> fields;  // in field order
  std::array<std::uint8_t, kNumbers> placeOf =
      {};  // in `fields`, by number; kNone for metrics' too

  constexpr MessagePlan(std::string_view name, std::span<const FieldPlan> all)
      : className(name), fields(all) {
    placeOf.fill(kNone);
    for (std::size_t i = 0; i < fields.size(); ++i) {
      const std::uint32_t number = fields[i].number;
      if (!KBBMetricUtility::mayBeMetric(number)) placeOf[number] = static_cast<std::uint8_t>(i);
    }
  }

  // The place of the field with this number, or kNone.
  std::uint8_t find(std::uint32_t number) const {
    return number < kNumbers ? placeOf[number] : kNone;
  }
};

// The plan of a class, kPlan.
template <class Message>
struct PlanOf;

}  // namespace qel
