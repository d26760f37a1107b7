// What every measurement of an LTE cell obeys, by which a layout that does not fit is found out.
#pragma once

#include <cstdint>
#include <span>

#include "sources/diagnostics/layouts/Layout.h"
#include "sources/diagnostics/picture/LteCells.h"

namespace qel::diagnostics {

inline constexpr std::uint32_t kLastPci = 503;        // 36.211, clause 6.11
inline constexpr std::uint32_t kLastEarfcn = 262143;  // 36.331, clause 6.3.4

// The antennas that received something; the others read as the scale's lowest.
LteAntennas antennasOf(const Values& cell);

// RSRQ is RSRP less RSSI by the number of resource blocks (36.214, clause 5.1.3), at each antenna
// with the same number; at its floor of -30 dB it is less than it reads.
bool serverAgrees(const LteAntennas& antennas);
bool neighbourAgrees(const LteAntennas& antennas);

// For a layout that is only tried: two antennas or more, none at a floor, every level a likely one,
// and the cell's RSRP that of the best antenna.
bool standsOut(const Values& cell, const LteAntennas& antennas);

// A cell, a channel and levels that can be.
bool isCell(const LteCellName& name);
bool isLikely(double rsrpDbm, double rsrqDb);

}  // namespace qel::diagnostics
