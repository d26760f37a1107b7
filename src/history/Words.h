// What the names of states and causes in reports mean, in words.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "base/Value.h"

namespace qel {

// A name of an enumeration, as records show it.
struct NamedWords {
  std::string_view name;
  std::string_view words;
  std::int32_t number = -1;  // of a cause as the network sends it; else -1
};

// Those of registration, by name.
std::span<const NamedWords> registrationWords();

// Nothing for a name that is not known.
const NamedWords* wordsFor(std::string_view name);

// The number of "(unknown: 12)", which records show for one that has no name; else empty.
std::string_view numberWithoutName(std::string_view text);

// The words of a record's value. A number without a name is itself, behind what it is one of:
// "state 12". Empty: there is no such value.
std::string wordsOf(const Value* value, std::string_view what);

}  // namespace qel
