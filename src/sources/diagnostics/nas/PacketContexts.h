// The life of 2G's and 3G's packet connections (24.008, clause 6.1.3).
#pragma once

#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/nas/MobileMessages.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

// The phone asks; nothing is reported yet.
void askForContext(std::uint32_t transaction, PacketConnection connection, Picture& picture);

// The network grants what was asked for. A grant whose request was not seen says too little.
void activateContext(std::uint32_t transaction, ActivateAccept accept, Picture& picture,
                     Told& told);

void endContext(std::uint32_t transaction, Picture& picture, Told& told);
void endAllContexts(Picture& picture, Told& told);

}  // namespace qel::diagnostics
