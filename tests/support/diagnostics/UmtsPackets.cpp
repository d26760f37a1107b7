#include "support/diagnostics/UmtsPackets.h"

#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {
namespace {

void digits(BodyWriter& body, const std::string& code) {
  constexpr unsigned kNoDigit = 15;
  for (std::size_t i = 0; i < 3; ++i)
    body.u8(i < code.size() ? static_cast<unsigned>(code[i] - '0') : kNoDigit);
}

std::uint8_t signedByte(int value) { return static_cast<std::uint8_t>(value); }
std::uint16_t signedWord(int value) { return static_cast<std::uint16_t>(value); }

// What is not read of an entry: something that would be seen if it were.
void unread(BodyWriter& body, std::size_t count) {
  for (std::size_t i = 0; i < count; ++i) body.u8(0x5A);
}

}  // namespace

Bytes umtsCell(const WrittenUmtsCell& cell) {
  BodyWriter body;
  body.u32(cell.uarfcn - 950).u32(cell.uarfcn).u32(cell.cellId);
  body.u16(0).u8(7).u8(0);  // registration area, flags, access
  body.u16(cell.scramblingCode << 4);
  digits(body, cell.mcc);
  digits(body, cell.mnc);
  body.u32(cell.areaCode).u32(0xBA);
  return body;
}

Bytes umtsRanks(unsigned version, const std::vector<WrittenUmtsRank>& umts,
                const std::vector<WrittenGsmRank>& gsm) {
  BodyWriter body;
  body.u8(version << 6 | umts.size()).u8(gsm.size());
  if (version == 2) unread(body, 5);
  constexpr std::size_t kUnreadOfUmts[] = {0, 1, 6};
  for (const WrittenUmtsRank& cell : umts) {
    body.u16(cell.uarfcn).u16(cell.scramblingCode);
    body.u8(signedByte(cell.rscpDbm + 21)).u16(signedWord(cell.rscpDbm));
    body.u8(signedByte(static_cast<int>(cell.ecnoDb * 2)));
    body.u16(signedWord(static_cast<int>(cell.ecnoDb * 2)));
    unread(body, kUnreadOfUmts[version]);
  }
  for (const WrittenGsmRank& cell : gsm) {
    body.u16(cell.arfcn).u16(cell.bsic);
    body.u8(signedByte(cell.levelDbm)).u16(signedWord(cell.levelDbm));
    unread(body, kUnreadOfUmts[version]);
  }
  return body;
}

Bytes umtsGainControl(const std::vector<WrittenUmtsFrame>& frames) {
  constexpr std::size_t kFrame = 55;
  BodyWriter body;
  body.u8(2).u8(1).u32(0x01010CFE);
  body.u16(6 + frames.size() * kFrame).u8(frames.size()).u8(127);
  for (const WrittenUmtsFrame& frame : frames) {
    const unsigned first = frame.first != kUmtsReceiverOff ? 1 : 0;
    const unsigned second = frame.second != kUmtsReceiverOff ? 1 : 0;
    body.u8(first | second << 4);
    unread(body, 5);
    body.u16(signedWord(frame.first));
    unread(body, 6);
    body.u16(signedWord(frame.second));
    unread(body, 6);
    body.u16(signedWord(frame.sent));
    unread(body, kFrame - 24);
  }
  return body;
}

Bytes umtsRrc(unsigned channel, ByteView message) {
  return BodyWriter().u8(channel).u8(0x28).u16(message.size()).bytes(message);
}

Bytes umtsRrcOf(unsigned channel, unsigned uarfcn, unsigned scramblingCode, ByteView message) {
  BodyWriter body;
  body.u8(channel).u8(0x28).u16(message.size()).u16(uarfcn).u16(scramblingCode);
  return body.bytes(message);
}

}  // namespace qel::diagnostics::test
