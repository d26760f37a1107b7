// The payloads of a busy phone: the same ones at every run.
#pragma once

#include "Payload.h"

namespace qel::bench {

// Mostly LTE signal, transmit power, neighbours and RRC states, with what else a phone reports now
// and then; about 64 bytes each.
std::vector<Payload> phoneMix(std::size_t count);

}  // namespace qel::bench
