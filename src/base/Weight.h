// What values take in memory.
#pragma once

#include <cstddef>

#include "base/Value.h"

namespace qel {

// In bytes, roughly, with all that is nested. For whoever bounds what is kept of others.
std::size_t weightOf(const Value& value);
std::size_t weightOf(const Dictionary& dictionary);

}  // namespace qel
