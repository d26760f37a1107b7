#include "sources/diagnostics/nas/PdpAddress.h"

#include <algorithm>

namespace qel::diagnostics {
namespace {

struct TypeRow {
  std::uint8_t organisation;  // 0 ETSI, 1 IETF
  std::uint8_t number;
  std::int32_t type;
  std::size_t addressOctets;
};
constexpr std::size_t kV4Octets = 4;
constexpr std::size_t kV6Octets = 16;
constexpr std::int32_t kBothTypes = 2;
constexpr TypeRow kTypes[] = {
    {0, 0x01, 6, 0},
    {1, 0x21, 0, kV4Octets},
    {1, 0x57, 1, kV6Octets},
    {1, 0x8D, kBothTypes, kV4Octets + kV6Octets},
};

}  // namespace

std::optional<PdpAddress> pdpAddress(ByteView value) {
  constexpr std::size_t kHeadOctets = 2;
  constexpr std::size_t kInterfaceOctets = 8;
  if (value.size() < kHeadOctets) return std::nullopt;
  const auto row = std::ranges::find_if(kTypes, [&](const TypeRow& type) {
    return type.organisation == (value[0] & 0xF) && type.number == value[1];
  });
  if (row == std::end(kTypes)) return std::nullopt;
  PdpAddress read{row->type, {}};
  const ByteView octets = value.subspan(kHeadOctets);
  if (row->addressOctets == 0 || octets.size() < row->addressOctets) return read;
  if (row->type != kBothTypes) {
    read.address.assign(octets.begin(), octets.begin() + static_cast<int>(row->addressOctets));
    return read;
  }
  // The interface identifier, which is the last half, then the IPv4 address.
  const ByteView interface = octets.subspan(kV4Octets + kV6Octets - kInterfaceOctets);
  read.address.assign(interface.begin(), interface.begin() + kInterfaceOctets);
  read.address.insert(read.address.end(), octets.begin(), octets.begin() + kV4Octets);
  return read;
}

}  // namespace qel::diagnostics
