#include "support/diagnostics/ModemBrain.h"

#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {
namespace {

std::uint32_t wordAt(ByteView bytes, std::size_t offset) {
  std::uint32_t word = 0;
  for (unsigned i = 0; i < 4 && offset + i < bytes.size(); ++i) {
    word |= std::uint32_t{bytes[offset + i]} << 8 * i;
  }
  return word;
}

Bytes refusal(std::uint8_t reason, ByteView request) {
  return BodyWriter().u8(reason).bytes(request);
}

Bytes versionAnswer() {
  return BodyWriter()
      .u8(0x00)
      .text("Nov 21 202612:34:56")
      .text("Nov 22 202601:02:03")
      .text("PSEUDO  ")
      .zeros(8);
}

Bytes buildAnswer() {
  return BodyWriter()
      .u8(0x7C)
      .u8(2)
      .u16(0)
      .u32(0x1234)
      .u32(77)
      .text("MPSS.PSEUDO.1.0-00042")
      .zeros(1)
      .text("Pseudo modem")
      .zeros(1);
}

}  // namespace

std::vector<Bytes> ModemBrain::answersTo(ByteView request) {
  if (request.empty()) return {};
  _requests.emplace_back(request.begin(), request.end());
  switch (manner) {
    case Manner::silent:
      return {};
    case Manner::refusing:
      if (request[0] == 0x73) return {refusal(0x47, request)};
      return honestly(request);
    case Manner::lying: {
      std::vector<Bytes> answers;
      for (Bytes answer : honestly(request)) {
        if (answer.size() > 4) answer[4] ^= 0x40;
        answers.push_back(Bytes{request[0]});
        answers.push_back(answer);
        answer.resize(answer.size() / 2);
        answers.push_back(answer);
      }
      return answers;
    }
    case Manner::withoutEvents:
      if (request[0] == 0x82) return {refusal(0x13, request)};
      return honestly(request);
    case Manner::honest:
      break;
  }
  return honestly(request);
}

std::vector<Bytes> ModemBrain::honestly(ByteView request) {
  switch (request[0]) {
    case 0x00:
      return {versionAnswer()};
    case 0x7C:
      return {buildAnswer()};
    case 0x60:
      if (request.size() != 2) break;
      _events = request[1] != 0;
      return {Bytes{0x60, 0, 0}};
    case 0x7D:
      if (request.size() != 8 || request[1] != 5) break;
      return {Bytes{0x7D, 5, 1, 0, 0, 0, 0, 0}};
    case 0x82:
      return {BodyWriter().u8(0x82).zeros(3).bytes(request.subspan(4))};
    case 0x73:
      if (request.size() < 8) break;
      return {logConfiguration(request)};
    default:
      break;
  }
  _forbidden.emplace_back(request.begin(), request.end());
  return {refusal(0x13, request)};
}

Bytes ModemBrain::logConfiguration(ByteView request) {
  const std::uint32_t operation = wordAt(request, 4);
  const std::uint32_t equipment = wordAt(request, 8);
  BodyWriter answer;
  answer.u8(0x73).zeros(3).u32(operation).u32(0);
  switch (operation) {
    case 0:
      _masks.clear();
      return answer;
    case 1:
      for (const std::uint32_t items : ranges) answer.u32(items);
      return answer;
    case 3: {
      const ByteView bits = request.subspan(16);
      if (equipment >= ranges.size() || wordAt(request, 12) > ranges[equipment]) break;
      _masks[equipment] = Bytes(bits.begin(), bits.end());
      return answer.u32(equipment).u32(wordAt(request, 12)).bytes(bits);
    }
    case 4:
      if (equipment >= ranges.size()) break;
      return answer.u32(equipment)
          .u32(ranges[equipment])
          .bytes(_masks.contains(equipment) ? _masks.at(equipment)
                                            : Bytes((ranges[equipment] + 7) / 8));
    default:
      _forbidden.emplace_back(request.begin(), request.end());
      break;
  }
  return refusal(0x14, request);
}

bool ModemBrain::sends(std::uint16_t code) const {
  const auto mask = _masks.find(code >> 12U);
  const unsigned item = code & 0xFFFU;
  return mask != _masks.end() && item / 8 < mask->second.size() &&
         (mask->second[item / 8] >> item % 8 & 1) != 0;
}

void ModemBrain::forget() {
  _masks.clear();
  _events = false;
}

}  // namespace qel::diagnostics::test
