#include "sources/diagnostics/nas/EpsElements.h"

#include <algorithm>
#include <array>

#include "sources/diagnostics/nas/InformationElements.h"

namespace qel::diagnostics {
namespace {

constexpr std::uint8_t kGuti = 6;     // type of identity
constexpr std::int32_t kPdpIPv4 = 3;  // PdpType, as connections of LTE
constexpr std::int32_t kPdpIPv6 = 4;
constexpr std::int32_t kPdpIPv4v6 = 5;
constexpr std::int32_t kPdpNone = 7;
constexpr std::uint32_t kNameServerIPv6 = 0x0003;
constexpr std::uint32_t kNameServerIPv4 = 0x000D;

PlmnCode networkIn(ElementReader& reader) {
  PlmnCode network{};
  const ByteView value = reader.value(network.size());
  std::ranges::copy(value, network.begin());
  return network;
}

std::uint32_t areaCodeIn(ElementReader& reader) {
  const std::uint32_t upper = reader.octet();
  return upper << 8 | reader.octet();
}

enum class ListType : std::uint8_t { oneNetwork, consecutive, manyNetworks };

void addPartialList(ElementReader& reader, std::vector<TrackingArea>& areas) {
  const std::uint8_t head = reader.octet();
  const auto type = static_cast<ListType>(head >> 5 & 3);
  const std::size_t count = (head & 0x1FU) + 1U;
  TrackingArea area;
  for (std::size_t i = 0; i < count && !reader.failed(); ++i) {
    if (i == 0 || type == ListType::manyNetworks) area.plmn = networkIn(reader);
    if (i == 0 || type != ListType::consecutive) {
      area.tac = areaCodeIn(reader);
    } else {
      area.tac = (area.tac + 1) & 0xFFFF;
    }
    areas.push_back(area);
  }
}

bool isPrintable(std::uint8_t character) { return character > 0x20 && character < 0x7F; }

}  // namespace

std::optional<std::vector<TrackingArea>> trackingAreas(ByteView value) {
  std::vector<TrackingArea> areas;
  ElementReader reader(value);
  while (!reader.rest().empty() && !reader.failed()) {
    if ((reader.rest()[0] >> 5 & 3) == 3) return std::nullopt;  // of a type that is not defined
    addPartialList(reader, areas);
  }
  if (reader.failed() || areas.empty() || areas.size() > kMostTrackingAreas) return std::nullopt;
  return areas;
}

std::optional<TemporaryIdentity> temporaryIdentity(ByteView value) {
  constexpr std::size_t kLength = 11;
  if (value.size() != kLength || (value[0] & 7) != kGuti) return std::nullopt;
  TemporaryIdentity identity;
  identity.group = std::uint32_t{value[4]} << 8 | value[5];
  identity.entity = value[6];
  for (std::size_t i = 7; i < kLength; ++i) identity.mTmsi = identity.mTmsi << 8 | value[i];
  return identity;
}

std::optional<std::vector<PlmnCode>> networkList(ByteView value) {
  constexpr std::size_t kEach = std::tuple_size_v<PlmnCode>;
  if (value.size() % kEach != 0 || value.size() > kMostEquivalentNetworks * kEach) {
    return std::nullopt;
  }
  std::vector<PlmnCode> networks;
  ElementReader reader(value);
  while (!reader.rest().empty()) networks.push_back(networkIn(reader));
  return networks;
}

std::optional<std::string> accessPointName(ByteView value) {
  if (value.size() > kMostAccessPointOctets) return std::nullopt;
  std::string name;
  ElementReader reader(value);
  while (!reader.rest().empty()) {
    const ByteView label = reader.counted();
    if (reader.failed() || !std::ranges::all_of(label, isPrintable)) return std::nullopt;
    if (!name.empty()) name += '.';
    name.append(label.begin(), label.end());
  }
  return name;
}

std::optional<PdnAddress> pdnAddress(ByteView value) {
  struct Row {
    std::int32_t type;
    std::size_t length;
  };
  constexpr std::size_t kInterface = 8;
  constexpr std::array<Row, 8> kTypes = {{{kPdpNone, 0},
                                          {kPdpIPv4, 4},
                                          {kPdpIPv6, kInterface},
                                          {kPdpIPv4v6, kInterface + 4},
                                          {kPdpNone, 0},
                                          {kPdpNone, 0},
                                          {kPdpNone, 0},
                                          {kPdpNone, 0}}};
  if (value.empty()) return std::nullopt;
  const Row& row = kTypes[value[0] & 7];
  if (value.size() <= row.length) return std::nullopt;
  const ByteView address = value.subspan(1, row.length);
  return PdnAddress{row.type, Bytes(address.begin(), address.end())};
}

std::optional<std::vector<Bytes>> nameServers(ByteView options) {
  std::vector<Bytes> servers;
  ElementReader reader(options);
  reader.octet();  // the configuration protocol
  while (!reader.rest().empty() && !reader.failed()) {
    const std::uint32_t upper = reader.octet();
    const std::uint32_t container = upper << 8 | reader.octet();
    const ByteView contents = reader.counted();
    const bool isServer = (container == kNameServerIPv4 && contents.size() == 4) ||
                          (container == kNameServerIPv6 && contents.size() == 16);
    if (isServer && servers.size() < 2) servers.emplace_back(contents.begin(), contents.end());
  }
  if (reader.failed()) return std::nullopt;
  return servers;
}

}  // namespace qel::diagnostics
