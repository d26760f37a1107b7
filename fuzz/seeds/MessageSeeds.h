// Messages to start from.
#pragma once

#include <vector>

#include "base/Bytes.h"

namespace qel::fuzz {

// One of every class, in the order of the classes, with all of its fields.
std::vector<Bytes> wholeMessages();

}  // namespace qel::fuzz
