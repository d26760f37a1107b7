// How LTE's neighbours are laid out.
#include "support/diagnostics/LteLevels.h"
#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics::test {
namespace {

Bytes listed(unsigned version, unsigned earfcn, const std::vector<WrittenLteCell>& cells) {
  constexpr std::size_t kCell = 52;
  const bool isOld = version == 3;
  const std::size_t head = isOld ? 4 : 8;
  BodyWriter data = unwritten(head + cells.size() * kCell);
  data.bitsAt(0, 0, isOld ? 16 : 32, earfcn);
  data.bitsAt(isOld ? 2 : 4, 0, 6, cells.size());
  std::size_t at = head;
  for (const WrittenLteCell& cell : cells) {
    const Levels levels(cell.antennas);
    data.bitsAt(at, 0, 10, cell.pci);
    data.bitsAt(at + 4, 0, 12, levels.rsrp(0)).bitsAt(at + 8, 0, 12, levels.rsrp(1));
    data.bitsAt(at + 12, 0, 12, levels.rsrp());
    data.bitsAt(at + 16, 0, 10, levels.rsrq(0)).bitsAt(at + 16, 20, 10, levels.rsrq(1));
    data.bitsAt(at + 20, 10, 10, levels.rsrq());
    data.bitsAt(at + 24, 0, 11, levels.rssi(0)).bitsAt(at + 28, 0, 11, levels.rssi(1));
    data.bitsAt(at + 28, 11, 11, levels.rssi());
    at += kCell;
  }
  return data;
}

}  // namespace

Bytes lteIdleNeighbours(unsigned version, unsigned earfcn,
                        const std::vector<WrittenLteCell>& cells) {
  return ofParts(26, 27, version, listed(version, earfcn, cells));
}

Bytes lteConnectedNeighbours(unsigned version, unsigned earfcn,
                             const std::vector<WrittenLteCell>& cells) {
  return ofParts(30, 31, version, listed(version, earfcn, cells));
}

Bytes lteConnectedCells(unsigned version, unsigned earfcn, const WrittenLteLevel& server,
                        const std::vector<WrittenLteLevel>& neighbours, unsigned detected,
                        unsigned carrier) {
  BodyWriter body;
  body.u8(version).zeros(3).u8(carrier).zeros(3);
  channel(body, version != 3, earfcn);
  body.u16(server.pci).u16(0x1234);
  body.u16(rsrpNumber(server.rsrpDbm)).u16(rsrpNumber(server.rsrpDbm));
  body.u16(rsrqNumber(server.rsrqDb)).u16(rsrqNumber(server.rsrqDb));
  body.u8(neighbours.size()).u8(detected);
  if (version != 3) body.u16(0);
  for (const WrittenLteLevel& cell : neighbours) {
    body.u16(cell.pci).u16(rsrpNumber(cell.rsrpDbm)).u16(rsrpNumber(cell.rsrpDbm));
    body.u16(rsrqNumber(cell.rsrqDb)).u16(rsrqNumber(cell.rsrqDb)).u16(0);
  }
  for (unsigned i = 0; i < detected; ++i) body.u16(100 + i).bytes(Bytes(14, 0x5A));
  return body;
}

Bytes lteIdleServing(unsigned version, unsigned earfcn, const WrittenLteLevel& server) {
  const bool isOld = version == 4;
  BodyWriter body;
  body.u8(version).u8(1).u16(0x5A5A);
  channel(body, !isOld, earfcn);
  body.u16(server.pci | 5U << 9);
  if (!isOld) body.u16(0);
  body.u32(rsrpNumber(server.rsrpDbm)).u32(rsrpNumber(server.rsrpDbm));
  body.u32(rsrqNumber(server.rsrqDb) | rsrqNumber(server.rsrqDb) << 20);
  body.u32(rssiNumber(-70) << 10).u32(0x08DD4900).u32(0x023EA786).u32(0);
  return body;
}

Bytes lteIdleIntra(unsigned version, unsigned earfcn,
                   const std::vector<WrittenLteLevel>& neighbours) {
  constexpr std::size_t kCell = 32;
  const bool isOld = version == 4;
  const std::size_t head = isOld ? 8 : 12;
  BodyWriter body = unwritten(head + neighbours.size() * kCell);
  body.bitsAt(0, 0, 8, version);
  body.bitsAt(4, 0, isOld ? 16 : 32, earfcn);
  body.bitsAt(isOld ? 4 : 8, isOld ? 22 : 6, 10, neighbours.size());
  std::size_t at = head;
  for (const WrittenLteLevel& cell : neighbours) {
    body.bitsAt(at, 0, 9, cell.pci).bitsAt(at, 9, 11, rssiNumber(-70));
    body.bitsAt(at, 20, 12, rsrpNumber(cell.rsrpDbm));
    body.bitsAt(at + 8, 12, 10, rsrqNumber(cell.rsrqDb));
    at += kCell;
  }
  return body;
}

}  // namespace qel::diagnostics::test
