// RRC messages of every channel.
#pragma once

#include <vector>

#include "base/Bytes.h"

namespace qel::fuzz {

// Each behind the byte of its channel.
std::vector<Bytes> rrcSeeds();

}  // namespace qel::fuzz
