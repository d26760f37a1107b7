#include "support/diagnostics/OtaPackets.h"

#include "rrc/BitWriter.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {
namespace {

using testing::BitWriter;

// What of a message follows when nothing of it is of interest: nothing optional, every choice the
// first.
BitWriter shortest() {
  BitWriter bits;
  for (int i = 0; i < 64; ++i) bits.bits(0, 8);
  return bits;
}

unsigned numberOf(unsigned version, AirChannel channel) {
  const auto place = static_cast<unsigned>(channel);
  switch (version) {
    case 9:
    case 12:
      return place + 8;
    case 14:
    case 15:
    case 16:
    case 20:
    case 24:
    case 25:
      return place < 2 ? place + 1 : place + 2;
    case 19:
    case 26:
    case 27:
    case 29:
    case 30:
    case 31:
      return place == 0 ? 1 : place == 1 ? 3 : place + 4;
    default:
      return place + 1;
  }
}

BitWriter systemInformation(unsigned block) {
  return BitWriter().bits(0b00, 2).flag(false).flag(false).number(1, 1, 32).flag(false).bits(block,
                                                                                             4);
}

BitWriter setup(unsigned parts) {
  BitWriter bits;
  bits.bits(0b011, 3).bits(1, 2).bits(0b0000, 4).flag(false);
  return bits.flag(false).bits(parts, 6);
}

BitWriter antennas(unsigned mode) {
  BitWriter bits;  // of the physical configuration only this
  bits.flag(false).bits(0b0000000010, 10).flag(false);
  return bits.flag(false).bits(mode - 1, 3).flag(false);
}

BitWriter reconfiguration(unsigned parts) {
  return BitWriter().bits(0b00100, 5).bits(0, 2).bits(0b0000, 4).bits(parts, 6);
}

BitWriter report(unsigned identity, unsigned technology, std::size_t count) {
  BitWriter bits;
  bits.bits(0b00001, 5).bits(0b0000, 4).flag(false);
  bits.flag(false).flag(true).number(identity, 1, 32).bits(60, 7).bits(20, 6);
  return bits.flag(false).bits(technology, 2).number(static_cast<std::int64_t>(count), 1, 8);
}

}  // namespace

const std::vector<unsigned>& airVersions() {
  static const std::vector<unsigned> kVersions = {2,  3,  4,  5,  6,  7,  8,  9,  12, 13, 14, 15,
                                                  16, 19, 20, 22, 24, 25, 26, 27, 29, 30, 31};
  return kVersions;
}

Bytes overTheAir(unsigned version, AirChannel channel, const Bytes& message, const AirCell& cell,
                 unsigned segment) {
  BodyWriter body;
  body.u8(version).u8(9).u8(1);
  if (version >= 25) body.u8(15).u8(3);
  body.u8(0).u16(cell.pci);
  if (version < 8) {
    body.u16(cell.earfcn);
  } else {
    body.u32(cell.earfcn);
  }
  body.u16(512U << 4U | 3U).u8(numberOf(version, channel));
  if (version >= 5) body.u32(0);
  body.u16(message.size());
  if (version >= 30) body.zeros(2).u8(segment);
  return body.bytes(message);
}

Bytes sib1Message(const AirSib1& sib) {
  const bool later = sib.ofRelease9 || !sib.bands.empty();
  BitWriter bits;
  bits.bits(0b01, 2).flag(false).flag(sib.tdd.has_value()).flag(later).flag(false);
  bits.number(1, 1, 6).flag(true).bits(0x001, 12).number(2, 2, 3).bits(0x01, 8).flag(false);
  bits.bits(0x2B1A, 16).bits(0x1234567, 28).bits(1, 1).bits(0, 1).flag(false);
  bits.flag(false).number(sib.qRxLevMin, -70, -22);
  bits.number(3, 1, 64).number(1, 1, 32).bits(2, 3).number(0, 0, 31);
  if (sib.tdd) bits.bits(sib.tdd->assignment, 3).bits(sib.tdd->pattern, 4);
  bits.bits(3, 3).bits(17, 5);
  if (!later) return bits.bytes();
  bits.flag(!sib.bands.empty()).flag(sib.ofRelease9);
  if (!sib.bands.empty()) {
    // What is above 64 has its own list, and a mark in this one.
    BitWriter first, second;
    bool wide = false;
    for (const unsigned band : sib.bands) {
      first.number(band > 64 ? 64 : band, 1, 64);
      second.flag(band > 64);
      if (band > 64) second.number(band, 65, 256);
      wide = wide || band > 64;
    }
    const auto count = static_cast<std::int64_t>(sib.bands.size());
    BitWriter list;
    list.flag(true).flag(wide).number(count, 1, 8).append(first);
    if (wide) list.bits(0b010, 3).number(count, 1, 8).append(second);
    bits.contained(list);
  }
  if (sib.ofRelease9) {
    bits.bits(0b110, 3).flag(false).number(sib.qQualMinDb, -34, -3);
  }
  return bits.bytes();
}

Bytes sib2Message(bool emergencyBarred, const std::optional<AirBarring>& signalling) {
  BitWriter bits = systemInformation(0);
  bits.flag(false).bits(0b10, 2);
  bits.flag(signalling.has_value()).flag(false).flag(emergencyBarred);
  if (signalling) {
    bits.bits(signalling->factor, 4).bits(signalling->time, 3).bits(signalling->classes, 5);
  }
  return bits.append(shortest()).bytes();
}

Bytes sib3Message(const AirSib3& sib) {
  BitWriter bits = systemInformation(1);
  bits.flag(false).flag(false).bits(sib.qHyst, 4);
  bits.flag(true).bits(sib.nonIntra, 5).bits(sib.low, 5).bits(sib.priority, 3);
  bits.bits(0b0100, 4).number(-60, -70, -22).bits(sib.intra, 5);
  return bits.flag(true).bits(2, 2).bits(1, 3).bytes();
}

Bytes sib5Message(const std::vector<AirFrequency>& frequencies) {
  BitWriter bits = systemInformation(3);
  bits.flag(false).number(static_cast<std::int64_t>(frequencies.size()), 1, 8);
  for (const AirFrequency& one : frequencies) {
    bits.flag(false).bits(0b00, 2).flag(one.priority.has_value()).flag(false).bits(0b00, 2);
    bits.bits(one.earfcn, 16).number(one.qRxLevMin, -70, -22).bits(2, 3);
    bits.bits(one.high, 5).bits(one.low, 5).bits(one.bandwidth, 3).flag(false);
    if (one.priority) bits.bits(*one.priority, 3);
    bits.bits(0, 2);
  }
  return bits.bytes();
}

Bytes connectionRequest(unsigned cause) {
  return BitWriter()
      .bits(0b01, 2)
      .flag(false)
      .flag(true)
      .bits(0x123456789A, 40)
      .bits(cause, 3)
      .flag(false)
      .bytes();
}

Bytes reestablishmentRequest(unsigned pci, unsigned cause) {
  return BitWriter()
      .bits(0b00, 2)
      .flag(false)
      .bits(0x1234, 16)
      .number(pci, 0, 503)
      .bits(0x5678, 16)
      .bits(cause, 2)
      .bits(0, 2)
      .bytes();
}

Bytes reestablishmentReject() { return BitWriter().bits(0b001, 3).append(shortest()).bytes(); }

Bytes connectionReject() { return BitWriter().bits(0b010, 3).append(shortest()).bytes(); }

Bytes connectionRelease(unsigned cause) {
  return BitWriter()
      .bits(0b00101, 5)
      .bits(1, 2)
      .bits(0b000, 3)
      .flag(false)
      .bits(0b00, 2)
      .bits(cause, 2)
      .bytes();
}

Bytes mobilityToUmts() {
  return BitWriter()
      .bits(0b00011, 5)
      .bits(0, 2)
      .bits(0b0000, 4)
      .flag(false)
      .flag(false)
      .bits(0b00, 2)
      .flag(false)
      .bits(0, 3)
      .contained(BitWriter().bits(0, 16))
      .bytes();
}

Bytes setupComplete() {
  return BitWriter()
      .bits(0b00100, 5)
      .bits(2, 2)
      .bits(0b000, 3)
      .bits(0b00, 2)
      .number(1, 1, 6)
      .length(1)
      .bits(7, 8)
      .bytes();
}

Bytes ciphering() { return BitWriter().bits(0b00110, 5).bits(0, 11).bytes(); }

Bytes plainSetup() { return setup(0).bytes(); }

Bytes setupWithDrx(const std::optional<AirDrx>& drx) {
  BitWriter bits = setup(0b000100);
  bits.flag(false).flag(false).bits(0b010, 3).flag(drx.has_value());
  if (drx) {
    bits.flag(drx->shortCycle).bits(drx->onDuration, 4).bits(drx->inactivity, 5);
    bits.bits(drx->retransmission, 3).bits(9, 4).number(123, 0, 319);
    if (drx->shortCycle) bits.bits(9, 4).number(2, 1, 16);
  }
  return bits.bits(7, 3).bytes();
}

Bytes setupWithAntennas(unsigned mode) {
  return setup(0b000001).append(antennas(mode)).append(shortest()).bytes();
}

Bytes reconfigurationWithAntennas(unsigned mode) {
  return reconfiguration(0b000100)
      .flag(false)
      .bits(0b000001, 6)
      .append(antennas(mode))
      .append(shortest())
      .bytes();
}

Bytes secondaryCells(const std::vector<unsigned>& removed, const std::vector<AirSecondary>& added) {
  BitWriter bits = reconfiguration(0b000001);
  bits.bits(0b01, 2).bits(0b001, 3);
  bits.flag(!removed.empty()).flag(!added.empty()).flag(false);
  if (!removed.empty()) bits.number(static_cast<std::int64_t>(removed.size()), 1, 4);
  for (const unsigned index : removed) bits.number(index, 1, 7);
  if (!added.empty()) bits.number(static_cast<std::int64_t>(added.size()), 1, 4);
  for (const AirSecondary& cell : added) {
    bits.flag(false).bits(0b100, 3).number(cell.index, 1, 7);
    bits.number(cell.pci, 0, 503).bits(cell.earfcn, 16);
  }
  return bits.bytes();
}

Bytes fullConfiguration() { return reconfiguration(0b000001).bits(0b01, 2).bits(0b010, 3).bytes(); }

Bytes handover(unsigned pci, std::uint32_t earfcn) {
  BitWriter bits = reconfiguration(0b010000);
  bits.flag(false).bits(0b1000, 4).number(pci, 0, 503).flag(false).bits(earfcn, 16);
  return bits.bits(2, 3).bits(0x4321, 16).append(shortest()).bytes();
}

Bytes measureConfiguration(const std::vector<AirMeasured>& measured) {
  const auto count = static_cast<std::int64_t>(measured.size());
  BitWriter bits = reconfiguration(0b100000);
  bits.flag(false).bits(0b01000100000, 11).number(count, 1, 32);
  for (const AirMeasured& one : measured) {
    bits.number(one.object, 1, 32).flag(false).bits(0, 2);
    bits.flag(false).bits(0, 6).bits(one.earfcn, 16).bits(5, 3).flag(false).bits(0, 2);
  }
  bits.number(count, 1, 32);
  for (const AirMeasured& one : measured) {
    bits.number(one.identity, 1, 32).number(one.object, 1, 32).number(1, 1, 32);
  }
  return bits.bytes();
}

Bytes measurementReport(unsigned identity, const std::vector<AirResult>& results) {
  BitWriter bits = report(identity, 0, results.size());
  for (const AirResult& one : results) {
    bits.flag(false).number(one.pci, 0, 503).flag(false);
    bits.flag(one.rsrp.has_value()).flag(one.rsrq.has_value());
    if (one.rsrp) bits.bits(*one.rsrp, 7);
    if (one.rsrq) bits.bits(*one.rsrq, 6);
  }
  return bits.bytes();
}

Bytes measurementReport(unsigned identity, const std::vector<AirUmtsResult>& results) {
  BitWriter bits = report(identity, 1, results.size());
  for (const AirUmtsResult& one : results) {
    bits.flag(false).flag(false).bits(one.psc, 9).flag(false).bits(0b11, 2);
    bits.number(one.rscp, -5, 91).bits(one.ecn0, 6);
  }
  return bits.bytes();
}

Bytes measurementReport(unsigned identity, const std::vector<AirGsmResult>& results) {
  BitWriter bits = report(identity, 2, results.size());
  for (const AirGsmResult& one : results) {
    bits.flag(false).bits(one.arfcn, 10).bits(0, 1).bits(one.network, 3).bits(one.station, 3);
    bits.flag(false).bits(one.rssi, 6);
  }
  return bits.bytes();
}

}  // namespace qel::diagnostics::test
