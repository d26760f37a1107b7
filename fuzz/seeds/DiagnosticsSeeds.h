// Packets as a modem writes them on its diagnostics port, for fuzz/targets/Diagnostics.cpp.
#pragma once

#include <vector>

#include "base/Bytes.h"

namespace qel::fuzz {

// One input a packet, and one of all of them.
std::vector<Bytes> diagnosticsSeeds();

}  // namespace qel::fuzz
