// The payloads of a phone in everyday use: the same ones at every run.
#pragma once

#include "Payload.h"

namespace qel::bench {

// Drawn from the shares of UsualKinds.h, with values that say nothing of anybody.
std::vector<Payload> usualMix(std::size_t count);

}  // namespace qel::bench
