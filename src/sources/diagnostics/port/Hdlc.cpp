#include "sources/diagnostics/port/Hdlc.h"

#include <array>

namespace qel::diagnostics {
namespace {

constexpr std::uint16_t kPolynomial = 0x8408;  // x^16 + x^12 + x^5 + 1, lowest bit first

constexpr std::array<std::uint16_t, 256> makeTable() {
  std::array<std::uint16_t, 256> table{};
  for (unsigned byte = 0; byte < table.size(); ++byte) {
    unsigned sum = byte;
    for (int bit = 0; bit < 8; ++bit) sum = (sum & 1) != 0 ? sum >> 1 ^ kPolynomial : sum >> 1;
    table[byte] = static_cast<std::uint16_t>(sum);
  }
  return table;
}

constexpr std::array kTable = makeTable();

void appendEscaped(Bytes& frame, std::uint8_t byte) {
  if (byte == kFrameMark || byte == kFrameEscape) {
    frame.push_back(kFrameEscape);
    byte ^= kEscapedBit;
  }
  frame.push_back(byte);
}

}  // namespace

std::uint16_t checkSum(ByteView bytes) {
  unsigned sum = 0xFFFF;
  for (const std::uint8_t byte : bytes) sum = sum >> 8 ^ kTable[(sum ^ byte) & 0xFF];
  return static_cast<std::uint16_t>(~sum);
}

Bytes frameOf(ByteView packet) {
  Bytes frame;
  frame.reserve(packet.size() + 2 * kCheckSumBytes + 1);
  for (const std::uint8_t byte : packet) appendEscaped(frame, byte);
  const std::uint16_t sum = checkSum(packet);
  appendEscaped(frame, static_cast<std::uint8_t>(sum & 0xFF));
  appendEscaped(frame, static_cast<std::uint8_t>(sum >> 8));
  frame.push_back(kFrameMark);
  return frame;
}

}  // namespace qel::diagnostics
