#include "support/diagnostics/GsmPackets.h"

#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {
namespace {

constexpr std::uint32_t kRadioResources = 6;

std::uint32_t digit(std::string_view digits, std::size_t index) {
  return index < digits.size() ? static_cast<std::uint32_t>(digits[index] - '0') : 0xF;
}

void putHighFirst(BodyWriter& out, std::uint32_t value) { out.u8(value >> 8).u8(value & 0xFF); }

void putSelection(BodyWriter& out, const Broadcast& cell, bool acs) {
  out.u8(cell.hysteresis << 5 | cell.mostPower);
  out.u8((acs ? 0x80U : 0) | (cell.neci ? 0x40U : 0) | cell.leastRxlev);
}

void putAccess(BodyWriter& out, const Broadcast& cell) {
  constexpr std::uint32_t kSpread = 14;
  out.u8(cell.retrans << 6 | kSpread << 2 | (cell.barred ? 2U : 0) |
         (cell.noReestablishment ? 1U : 0));
  putHighFirst(out, cell.classes);
}

void putReselection(RestWriter& rest, const Broadcast& cell) {
  rest.high(cell.c2);
  if (cell.c2) {
    rest.bits(cell.cbq ? 1 : 0, 1).bits(cell.offset, 6).bits(cell.temporary, 3);
    rest.bits(cell.penalty, 5);
  }
  rest.high(cell.powerOffset);
  if (cell.powerOffset) rest.bits(3, 2);
}

void putIndicator(RestWriter& rest, const Broadcast& cell) {
  rest.high(cell.gprs);
  if (cell.gprs) rest.bits(5, 3).bits(1, 1);
}

void putMobileAllocation(RestWriter& rest, std::uint32_t kind) {
  rest.bits(33, 6);  // hopping sequence
  rest.bits(1, 1).bits(3, 4).bits(1, 1).bits(9, 4).bits(0, 1);
  if (kind == 1) {
    rest.bits(0, 1).bits(8, 6).bits(0x155, 9);
  } else {
    rest.bits(1, 1).bits(1, 1).bits(17, 6).bits(1, 1).bits(44, 6).bits(0, 1);
  }
}

}  // namespace

RestWriter& RestWriter::high(bool value) {
  const bool padding = (0x2B >> (7 - _bits.size() % 8) & 1) != 0;
  _bits.push_back(padding != value);
  return *this;
}

RestWriter& RestWriter::bits(std::uint32_t value, unsigned count) {
  while (count-- > 0) _bits.push_back((value >> count & 1) != 0);
  return *this;
}

Bytes RestWriter::padded(std::size_t octets) const {
  Bytes out(octets, 0x2B);
  for (std::size_t i = 0; i < _bits.size() && i / 8 < octets; ++i) {
    const auto mask = static_cast<std::uint8_t>(0x80 >> i % 8);
    std::uint8_t& octet = out[i / 8];
    octet = static_cast<std::uint8_t>(_bits[i] ? octet | mask : octet & ~mask);
  }
  return out;
}

Bytes plmn(std::string_view digits) {
  return BodyWriter()
      .u8(digit(digits, 1) << 4 | digit(digits, 0))
      .u8(digit(digits, 5) << 4 | digit(digits, 2))
      .u8(digit(digits, 4) << 4 | digit(digits, 3));
}

Bytes area(std::string_view digits, std::uint32_t lac) {
  BodyWriter out;
  out.bytes(plmn(digits));
  putHighFirst(out, lac);
  return out;
}

Bytes systemInformation3(const Broadcast& cell) {
  BodyWriter out;
  out.u8(kRadioResources).u8(0x1B);
  putHighFirst(out, cell.cellId);
  out.bytes(area(cell.network, cell.lac));
  out.u8(0x80U | (cell.attach ? 0x40U : 0) | 1 << 3).u8(cell.multiframes).u8(cell.t3212);
  out.u8(cell.dtx << 4 | cell.linkTimeout);
  putSelection(out, cell, false);
  putAccess(out, cell);
  RestWriter rest;
  putReselection(rest, cell);
  rest.high(cell.si2ter).high(cell.ecsc).high(cell.scheduling);
  if (cell.scheduling) rest.bits(5, 3);
  putIndicator(rest, cell);
  return out.bytes(rest.padded(4));
}

std::uint32_t fixedOctets4(const Broadcast& cell) { return cell.cbch ? 16 : 12; }

Bytes systemInformation4(const Broadcast& cell) {
  BodyWriter out;
  out.u8(kRadioResources).u8(0x1C).bytes(area(cell.network, cell.lac));
  putSelection(out, cell, cell.acs);
  putAccess(out, cell);
  if (cell.cbch) out.u8(0x64).u8(0x51).u8(0xA3).u8(0x26);
  RestWriter rest;
  putReselection(rest, cell);
  putIndicator(rest, cell);
  return out.bytes(rest.padded(22 - fixedOctets4(cell)));
}

Bytes systemInformation6(const Broadcast& cell) {
  BodyWriter out;
  out.u8(kRadioResources).u8(0x1E);
  putHighFirst(out, cell.cellId);
  return out.bytes(area(cell.network, cell.lac)).u8(0x17).u8(0xFF).bytes(RestWriter().padded(7));
}

Bytes systemInformation2ter(std::uint32_t multibandReporting) {
  return BodyWriter()
      .u8(kRadioResources)
      .u8(0x03)
      .u8(0x8E | multibandReporting << 5)
      .zeros(15)
      .bytes(RestWriter().padded(4));
}

Bytes measurementReport(std::uint32_t rxlevSub, std::uint32_t rxqualSub, bool valid) {
  return BodyWriter()
      .u8(kRadioResources)
      .u8(0x15)
      .u8(0x40 | 21)  // with discontinuous transmission, full level
      .u8((valid ? 0 : 0x40U) | rxlevSub)
      .u8(3U << 4 | rxqualSub << 1 | 1U)  // full quality, many neighbours
      .u8(0xC0)
      .zeros(12);
}

Bytes systemInformation13(const PacketService& service) {
  RestWriter rest;
  rest.high(true).bits(6, 3).bits(4, 4);
  rest.bits(service.mobileAllocation == 0 ? 0 : 1, 1);
  if (service.mobileAllocation != 0) {
    rest.bits(2, 2);
    putMobileAllocation(rest, service.mobileAllocation);
  }
  rest.bits(service.packetChannel ? 1 : 0, 1);
  if (service.packetChannel) {
    rest.bits(5, 4);
  } else {
    rest.bits(service.rac, 8).bits(service.splitPaging ? 1 : 0, 1).bits(service.priority, 3);
    rest.bits(service.controlOrder, 2);
    rest.bits(service.mode, 2).bits(2, 3).bits(5, 3).bits(4, 3).bits(1, 1).bits(0, 1).bits(9, 4);
    rest.bits(service.pan ? 1 : 0, 1);
    if (service.pan) rest.bits(1, 3).bits(2, 3).bits(4, 3);
    rest.bits(service.extension ? 1 : 0, 1);
    if (service.extension) {
      const std::uint32_t length = service.edge ? 16 : 11;
      rest.bits(length - 1, 6).bits(service.edge ? 1 : 0, 1);
      if (service.edge) rest.bits(1, 1).bits(5, 4);
      rest.bits(0, 4).bits(service.extendedUplink ? 1 : 0, 1);
      rest.bits(0, 5);
    }
    rest.bits(8, 4).bits(12, 5).bits(10, 5).bits(0, 1).bits(2, 4);
  }
  return BodyWriter().u8(kRadioResources).u8(0x00).bytes(rest.padded(20));
}

Bytes radioMessage(RadioChannel channel, const Bytes& message) {
  return BodyWriter()
      .u8(0x80U | static_cast<std::uint32_t>(channel))
      .u8(message[1])
      .u8(message.size())
      .bytes(message);
}

Bytes radioMessage(RadioChannel channel, const Bytes& message, std::uint32_t fixedOctets) {
  return BodyWriter()
      .u8(0x80U | static_cast<std::uint32_t>(channel))
      .u8(message[1])
      .u8(message.size() + 1)
      .u8(fixedOctets << 2 | 1)
      .bytes(message);
}

}  // namespace qel::diagnostics::test
