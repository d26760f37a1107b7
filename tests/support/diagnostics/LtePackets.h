// Bodies of a modem's logs about LTE's cells, levels and power, version by version.
#pragma once

#include <cstdint>
#include <vector>

#include "base/Bytes.h"
#include "support/diagnostics/SpeakingModem.h"

namespace qel::diagnostics::test {

using LteModem = SpeakingModem;

struct WrittenLteServingCell {
  unsigned pci = 185;
  unsigned earfcn = 5780;
  unsigned ulEarfcn = 23780;
  unsigned dlBlocks = 50;
  unsigned ulBlocks = 50;
  unsigned cellId = 44336657;
  unsigned area = 21512;
  unsigned band = 17;
  unsigned mcc = 310;
  unsigned mncDigits = 3;
  unsigned mnc = 410;
};
Bytes lteServingCell(unsigned version, const WrittenLteServingCell& cell = {});  // 0xB0C2

struct WrittenLteBroadcast {
  unsigned pci = 97;
  unsigned earfcn = 2300;
  unsigned blocks = 100;
};
Bytes lteMasterInformation(unsigned version, const WrittenLteBroadcast& cell = {});  // 0xB0C1
Bytes lteFoundCell(unsigned version, const WrittenLteBroadcast& cell = {});          // 0xB197
Bytes lteNewCellEvent(unsigned earfcn, unsigned pci);                                // event 1611

struct WrittenLteAntenna {
  double rsrpDbm = 0;
  double rsrqDb = 0;
  double rssiDbm = 0;
  double snrDb = 0;
};
// One whose RSRQ is what the other two make it over so many resource blocks.
WrittenLteAntenna heard(double rsrpDbm, double rssiDbm, unsigned blocks, double snrDb = 0);
// One that is not there.
WrittenLteAntenna deaf();

struct WrittenLteCell {
  unsigned pci = 0;
  std::vector<WrittenLteAntenna> antennas;
  unsigned carrier = 0;
  bool serves = true;
};

inline constexpr unsigned kLteMeasurementVersions[] = {4,  7,  18, 19, 22, 24, 35,
                                                       36, 40, 48, 50, 60, 66};
// 0xB193 as that version writes it; it may call itself by another number.
Bytes lteMeasurement(unsigned version, unsigned earfcn, const std::vector<WrittenLteCell>& cells);
Bytes lteMeasurementCalled(unsigned name, unsigned version, unsigned earfcn,
                           const std::vector<WrittenLteCell>& cells);

// 0xB192 and 0xB195.
inline constexpr unsigned kLteListedVersions[] = {3, 4, 24, 40};
Bytes lteIdleNeighbours(unsigned version, unsigned earfcn,
                        const std::vector<WrittenLteCell>& cells);
Bytes lteConnectedNeighbours(unsigned version, unsigned earfcn,
                             const std::vector<WrittenLteCell>& cells);

struct WrittenLteLevel {
  unsigned pci = 0;
  double rsrpDbm = 0;
  double rsrqDb = 0;
};
// 0xB179: the server and its neighbours on that channel, and cells of which nothing else is known.
Bytes lteConnectedCells(unsigned version, unsigned earfcn, const WrittenLteLevel& server,
                        const std::vector<WrittenLteLevel>& neighbours, unsigned detected = 0,
                        unsigned carrier = 0);
// 0xB17F.
Bytes lteIdleServing(unsigned version, unsigned earfcn, const WrittenLteLevel& server);
// 0xB180.
Bytes lteIdleIntra(unsigned version, unsigned earfcn,
                   const std::vector<WrittenLteLevel>& neighbours);

struct WrittenLtePower {
  unsigned subframe = 0;
  int dbm = 0;
};
Bytes ltePusch(unsigned version, const std::vector<WrittenLtePower>& powers);  // 0xB16E
Bytes ltePucch(unsigned version, const std::vector<WrittenLtePower>& powers);  // 0xB16F

}  // namespace qel::diagnostics::test
