// Logs of GSM as a modem writes them, and the messages of 44.018 in them.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "base/Bytes.h"

namespace qel::diagnostics::test {

// Bits from the highest on; L and H against the padding 0010 1011.
class RestWriter {
 public:
  RestWriter& high(bool value);
  RestWriter& bits(std::uint32_t value, unsigned count);
  // With padding to that length.
  Bytes padded(std::size_t octets) const;

 private:
  std::vector<bool> _bits;
};

// Three digits of the country, two or three of the network.
Bytes plmn(std::string_view digits);
Bytes area(std::string_view digits, std::uint32_t lac);

// What a cell broadcasts, as it is signalled.
struct Broadcast {
  std::string_view network = "00101";
  std::uint32_t lac = 0x1234;
  std::uint32_t cellId = 0xABCD;
  // Control channel description
  bool attach = true;
  std::uint32_t multiframes = 3;  // 5
  std::uint32_t t3212 = 20;
  // Cell options
  std::uint32_t dtx = 1;
  std::uint32_t linkTimeout = 5;  // 24
  // Cell selection
  std::uint32_t hysteresis = 3;  // 6 dB
  std::uint32_t mostPower = 7;
  bool acs = false;
  bool neci = true;
  std::uint32_t leastRxlev = 9;
  // Random access
  std::uint32_t retrans = 2;  // 4
  bool barred = false;
  bool noReestablishment = false;
  std::uint32_t classes = 0x0401;
  // Rest octets
  bool c2 = true;
  bool cbq = true;
  std::uint32_t offset = 10;
  std::uint32_t temporary = 2;  // 20 dB
  std::uint32_t penalty = 4;    // 100 s
  bool powerOffset = false;
  bool si2ter = true;
  bool ecsc = true;
  bool scheduling = false;
  bool gprs = true;
  bool cbch = true;
};

// From the protocol discriminator on, without the length in front.
Bytes systemInformation3(const Broadcast& cell);
Bytes systemInformation4(const Broadcast& cell);
Bytes systemInformation6(const Broadcast& cell);
Bytes systemInformation2ter(std::uint32_t multibandReporting);
Bytes measurementReport(std::uint32_t rxlevSub, std::uint32_t rxqualSub, bool valid = true);

struct PacketService {
  std::uint32_t mobileAllocation = 0;  // 0 none, 1 a bitmap of 9, 2 indices
  bool packetChannel = false;          // PBCCH
  std::uint32_t rac = 0x77;
  bool splitPaging = true;
  std::uint32_t priority = 5;
  std::uint32_t controlOrder = 2;
  std::uint32_t mode = 1;  // II
  bool pan = true;
  bool extension = true;
  bool edge = true;
  bool extendedUplink = true;
};
Bytes systemInformation13(const PacketService& service);

// 0x512F. `length`: the pseudo length in front; nothing for those who have none.
enum class RadioChannel : std::uint8_t { dedicated, broadcast, random, common, slow, standAlone };
Bytes radioMessage(RadioChannel channel, const Bytes& message);
Bytes radioMessage(RadioChannel channel, const Bytes& message, std::uint32_t fixedOctets);

// How much of type 4 is not rest octets.
std::uint32_t fixedOctets4(const Broadcast& cell);

}  // namespace qel::diagnostics::test
