// Bytes as a damaged or odd sender would send them.
#pragma once

#include "RandomMessage.h"

namespace qel::testing {

// The bytes with one to three kinds of damage: cut off, bits flipped, bytes replaced, or things put
// in anywhere, such as unknown fields, groups, metric identifiers and varints without an end.
Bytes damaged(RandomMessages& random, Bytes bytes);

}  // namespace qel::testing
