// Blocks of system information: from their bits into the picture.
#pragma once

#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/packets/Packet.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

// The type as the modem numbers it: blocks 1 to 7 and 11 by their own numbers, 67 block 19. What
// cannot be read tells nothing.
Outcome readUmtsBlock(unsigned type, ByteView block, std::uint64_t timeMs, Picture& picture,
                      Told& told);

}  // namespace qel::diagnostics
