// Carriers of GSM as the modem's logs name them.
#pragma once

#include <cstdint>

#include "sources/diagnostics/picture/GsmPicture.h"

namespace qel::diagnostics {

// A word of channel and, in the highest four bits, band. Of the 900 MHz bands it is the narrowest
// one that has the channel (45.005, clause 2); no band where the channel lies in none of its own.
GsmCarrier carrierOf(std::uint32_t word);

}  // namespace qel::diagnostics
