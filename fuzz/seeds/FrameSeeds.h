// What modems send on their diagnostics ports.
#pragma once

#include <vector>

#include "base/Bytes.h"

namespace qel::fuzz {

// As fuzz/targets/Frames.cpp takes it.
std::vector<Bytes> frameSeeds();

}  // namespace qel::fuzz
