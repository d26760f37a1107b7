#include "sources/diagnostics/packets/Plmn.h"

#include <algorithm>

namespace qel::diagnostics {

PlmnCode plmnAt(ByteView bytes, std::size_t offset) {
  PlmnCode plmn;
  std::ranges::copy(bytes.subspan(offset, kPlmnBytes), plmn.begin());
  return plmn;
}

LocationArea locationAreaAt(ByteView bytes, std::size_t offset) {
  const std::uint32_t high = bytes[offset + 3];
  return {plmnAt(bytes, offset), high << 8 | bytes[offset + 4]};
}

RoutingArea routingAreaAt(ByteView bytes, std::size_t offset) {
  return {locationAreaAt(bytes, offset), bytes[offset + kLocationAreaBytes]};
}

std::optional<Network> networkOf(const PlmnCode& plmn) {
  constexpr std::uint32_t kFiller = 0xF;
  const auto low = [&](std::size_t i) -> std::uint32_t { return plmn[i] & 0xFU; };
  const auto high = [&](std::size_t i) -> std::uint32_t { return plmn[i] >> 4U; };
  for (const std::uint32_t digit : {low(0), high(0), low(1), low(2), high(2)}) {
    if (digit > 9) return std::nullopt;
  }
  const std::uint32_t last = high(1);
  if (last > 9 && last != kFiller) return std::nullopt;
  Network network;
  network.mcc = low(0) * 100 + high(0) * 10 + low(1);
  network.mnc = low(2) * 10 + high(2);
  network.mncDigits = 2;
  if (last != kFiller) {
    network.mnc = network.mnc * 10 + last;
    network.mncDigits = 3;
  }
  return network;
}

PlmnCode plmnOf(const Network& network) {
  const bool three = network.mncDigits == 3;
  const std::uint32_t mnc = three ? network.mnc / 10 : network.mnc;
  const std::uint32_t last = three ? network.mnc % 10 : 0xFU;
  const auto octet = [](std::uint32_t high, std::uint32_t low) {
    return static_cast<std::uint8_t>(high << 4U | low);
  };
  return {octet(network.mcc / 10 % 10, network.mcc / 100 % 10), octet(last, network.mcc % 10),
          octet(mnc % 10, mnc / 10 % 10)};
}

}  // namespace qel::diagnostics
