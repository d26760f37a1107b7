// What a modem says, to start from.
#pragma once

#include <vector>

#include "base/Bytes.h"

namespace qel::fuzz {

// Registered modems of LTE, UMTS and GSM with a SIM and a bearer, as fuzz/targets/Modems.cpp reads
// them. Their identities are those of the test networks.
std::vector<Bytes> modems();

}  // namespace qel::fuzz
