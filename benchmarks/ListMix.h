// Payloads with lists of every length, for what an element costs.
#pragma once

#include <cstdint>

#include "Payload.h"

namespace qel::bench {

// Reports of so many LTE neighbours.
std::vector<Payload> listPayloads(std::uint32_t elements);

}  // namespace qel::bench
