// Measurements whose layout is taken only when the levels in it agree with one another.
#pragma once

#include <cstdint>
#include <vector>

#include "sources/diagnostics/layouts/Layout.h"
#include "sources/diagnostics/packets/Packet.h"
#include "sources/diagnostics/picture/LteCells.h"

namespace qel::diagnostics {

struct JudgedCell {
  LteCellName name;
  LteAntennas antennas;
  Values values;
};

struct JudgedCells {
  Outcome outcome = Outcome::damaged;
  std::vector<JudgedCell> cells;  // those that agree
};

// Reads the part with that id of a packet's body. A version that is not known is tried by the
// layouts of the versions that are, the nearest first, and only taken when every cell of it stands
// out. `agrees` judges a cell.
JudgedCells readJudged(const LogPacket& packet, std::uint8_t part,
                       bool (*agrees)(const LteAntennas& antennas));

}  // namespace qel::diagnostics
