// What one line of a recording may hold. A reader refuses a line beyond it, and a writer makes
// none.
#pragma once

#include <cstddef>

#include "base/Value.h"

namespace qel {

inline constexpr std::size_t kLongestLineBytes = 1024 * 1024;  // without the newline
inline constexpr std::size_t kMostKeysOfAnObject = 256;
inline constexpr std::size_t kMostValuesOfALine = 65536;  // elements and values of keys
inline constexpr std::size_t kDeepestNesting = 32;        // objects and arrays, the line's own too

// The keys of a line that are not the event's own: its time and its kind.
inline constexpr std::size_t kKeysOfTheLine = 2;

// Whether a line with these entries is within the limits, but for its length.
bool isWithinLineLimits(const Dictionary& entries);

}  // namespace qel
