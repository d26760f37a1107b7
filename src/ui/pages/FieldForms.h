// What a value of a field stands for, beyond its number or bytes.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "base/Value.h"
#include "messages/catalogue/FieldFacts.h"

namespace qel {

struct FieldPart {
  std::string label;
  std::string text;

  friend bool operator==(const FieldPart&, const FieldPart&) = default;
};

// A value as it came, with the fields that stand beside it.
struct RawField {
  const FieldFacts& facts;
  const Value& value;
  const MessageFacts& message;
  const Dictionary& record;
};

// Of the entries of a list; how many more there are is said.
inline constexpr std::size_t kMostFieldParts = 64;

// The value split or decoded: what there is to tell, else nothing. A field that holds messages has
// a part for each of their fields, or for each entry of a list.
std::vector<FieldPart> partsOf(const RawField& field);

// The value's meaning among those of its enumeration; null: it is none, or has no such value.
const ValueMeaning* meaningOf(const RawField& field);

// The number as it travels; nothing for what is none.
std::optional<std::int64_t> rawNumber(const RawField& field);

}  // namespace qel
