#include "support/diagnostics/LtePackets.h"

#include "support/diagnostics/LteLevels.h"

namespace qel::diagnostics::test {
namespace {

// Where one record has its subframe and its power, by first bit.
struct PowerPlaces {
  unsigned subframe;  // in the first word
  unsigned power;     // in the third word
};

Bytes powers(unsigned version, PowerPlaces places, const std::vector<WrittenLtePower>& powers) {
  BodyWriter body;
  body.u8(version).u16(0).u8(powers.size());
  std::size_t at = 4;
  for (const WrittenLtePower& power : powers) {
    body.bytes(Bytes(12, 0x5A));
    body.bitsAt(at, places.subframe, 4, power.subframe);
    body.bitsAt(at + 8, places.power, 8, static_cast<std::uint8_t>(power.dbm));
    at += 12;
  }
  return body;
}

}  // namespace

Bytes lteServingCell(unsigned version, const WrittenLteServingCell& cell) {
  const bool isWide = version > 2;
  BodyWriter body;
  body.u8(version).u16(cell.pci);
  channel(body, isWide, cell.earfcn);
  channel(body, isWide, cell.ulEarfcn);
  body.u8(cell.dlBlocks).u8(cell.ulBlocks).u32(cell.cellId).u16(cell.area).u32(cell.band);
  body.u16(cell.mcc).u8(cell.mncDigits).u16(cell.mnc).u8(1);
  return body;
}

Bytes lteMasterInformation(unsigned version, const WrittenLteBroadcast& cell) {
  BodyWriter body;
  body.u8(version).u16(cell.pci);
  channel(body, version > 1, cell.earfcn);
  body.u16(0x250).u8(2).u8(cell.blocks);
  if (version > 2) body.u8(7);
  return body;
}

Bytes lteFoundCell(unsigned version, const WrittenLteBroadcast& cell) {
  constexpr unsigned kBeyondNumber = 0x4200;
  BodyWriter body;
  body.u8(version).u8(cell.blocks).u16(0x14C);
  channel(body, version > 1, cell.earfcn);
  channel(body, version > 1, cell.pci | kBeyondNumber);
  body.u32(0).u32(0x70).u64(0x2961).u32(0xA94C).u16(0).u16(1);
  return body;
}

Bytes lteNewCellEvent(unsigned earfcn, unsigned pci) {
  return BodyWriter().u8(0).u16(earfcn).u16(pci);
}

Bytes ltePusch(unsigned version, const std::vector<WrittenLtePower>& list) {
  const PowerPlaces places = version == 4   ? PowerPlaces{10, 5}
                             : version == 5 ? PowerPlaces{10, 15}
                                            : PowerPlaces{13, 15};
  return powers(version, places, list);
}

Bytes ltePucch(unsigned version, const std::vector<WrittenLtePower>& list) {
  return powers(version, {10, 16}, list);
}

}  // namespace qel::diagnostics::test
