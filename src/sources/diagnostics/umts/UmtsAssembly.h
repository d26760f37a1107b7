// Puts blocks of system information together from their segments (25.331, clause 8.1.1.1.4).
#pragma once

#include <functional>

#include "rrc/umts/Broadcast.h"
#include "sources/diagnostics/picture/UmtsSegments.h"

namespace qel::diagnostics {

// A whole block, its last byte filled up with zeros; valid during the call.
using TakeUmtsBlock = std::function<void(unsigned type, ByteView block)>;

// Segments make a block only when they come in order, no further apart than a cell may send them,
// by the clock of one and the same cell, and without another master block in between; else what
// has come of it is dropped.
void assemble(const rrc::umts::BroadcastBlock& block, ByteView message, std::uint64_t timeMs,
              UmtsSegments& segments, const TakeUmtsBlock& take);

}  // namespace qel::diagnostics
