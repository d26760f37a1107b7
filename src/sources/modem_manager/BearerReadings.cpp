#include "sources/modem_manager/BearerReadings.h"

#include <arpa/inet.h>
#include <strings.h>

#include <algorithm>
#include <array>
#include <optional>
#include <utility>

#include "sources/modem_manager/Names.h"

namespace qel::sources {
namespace {

constexpr std::size_t kMostBearers = 32;

Bytes addressOf(const BusProperties& configuration, const char* key, int family) {
  std::array<std::uint8_t, 16> address{};
  const std::string text = busValue<std::string>(configuration, key).value_or("");
  if (::inet_pton(family, text.c_str(), address.data()) != 1) return {};
  // 0.0.0.0 and :: are no addresses (RFC 1122, 3.2.1.3; RFC 4291, 2.5.2).
  if (std::ranges::count(address, 0) == std::ssize(address)) return {};
  const std::ptrdiff_t size = family == AF_INET ? 4 : 16;
  return {address.begin(), address.begin() + size};
}

struct AddressKind {
  const char* property;
  int family;
  Bytes BearerReading::*address;
  bool BearerReading::*inUse;
};
constexpr std::array kAddressKinds = {
    AddressKind{"Ip4Config", AF_INET, &BearerReading::address4, &BearerReading::uses4},
    AddressKind{"Ip6Config", AF_INET6, &BearerReading::address6, &BearerReading::uses6},
};

// Nothing unless it is connected.
std::optional<BearerReading> bearerReading(const BusProperties& bearer) {
  if (!busValue<bool>(bearer, "Connected").value_or(false)) return std::nullopt;
  BearerReading reading;
  const auto asked = busValue<BusProperties>(bearer, "Properties").value_or(BusProperties());
  reading.apn = busValue<std::string>(asked, "apn").value_or("");
  reading.profile = busUnsigned(bearer, "ProfileId").value_or(0);
  if (reading.profile == 0) reading.profile = busUnsigned(asked, "profile-id").value_or(0);
  for (const AddressKind& kind : kAddressKinds) {
    const auto configuration = busValue<BusProperties>(bearer, kind.property);
    if (!configuration) continue;
    reading.*kind.address = addressOf(*configuration, "address", kind.family);
    reading.*kind.inUse =
        !(reading.*kind.address).empty() || busUnsigned(*configuration, "method").value_or(0) != 0;
    for (const char* key : {"dns1", "dns2", "dns3"}) {
      if (Bytes server = addressOf(*configuration, key, kind.family); !server.empty()) {
        reading.nameServers.push_back(std::move(server));
      }
    }
  }
  return reading;
}

std::string initialPathOf(const BusInterfaces& modem) {
  return busValue<sdbus::ObjectPath>(propertiesOf(modem, mm::kModem3gpp), "InitialEpsBearer")
      .value_or(mm::kNoObject);
}

void fillIpVersions(BearerReading& reading, const BusProperties& properties) {
  if (reading.uses4 || reading.uses6) return;
  const std::uint32_t types = busUnsigned(properties, "ip-type").value_or(0);
  constexpr std::uint32_t kKnown = mm::kIpv4 | mm::kIpv6 | mm::kIpv4v6;
  if ((types & ~kKnown) != 0) return;  // such as any
  reading.uses4 = (types & (mm::kIpv4 | mm::kIpv4v6)) != 0;
  reading.uses6 = (types & (mm::kIpv6 | mm::kIpv4v6)) != 0;
}

// What it says of itself comes before what was asked for.
BearerReading initialReading(BearerReading reading, const BusProperties& bearer,
                             const BusInterfaces& modem) {
  fillIpVersions(reading, busValue<BusProperties>(bearer, "Properties").value_or(BusProperties()));
  const auto asked =
      busValue<BusProperties>(propertiesOf(modem, mm::kModem3gpp), "InitialEpsBearerSettings")
          .value_or(BusProperties());
  if (reading.apn.empty()) reading.apn = busValue<std::string>(asked, "apn").value_or("");
  if (reading.profile == 0) reading.profile = busUnsigned(asked, "profile-id").value_or(0);
  fillIpVersions(reading, asked);
  return reading;
}

// A program that asks for the network that the phone is connected to already gets that connection.
bool isAmong(const std::vector<BearerReading>& bearers, const BearerReading& initial) {
  return std::ranges::any_of(bearers, [&](const BearerReading& bearer) {
    return initial.apn.empty() || ::strcasecmp(bearer.apn.c_str(), initial.apn.c_str()) == 0;
  });
}

}  // namespace

std::vector<std::string> bearerPathsOf(const BusInterfaces& modem) {
  const auto listed =
      busValue<std::vector<sdbus::ObjectPath>>(propertiesOf(modem, mm::kModem), "Bearers")
          .value_or(std::vector<sdbus::ObjectPath>());
  std::vector<std::string> paths(
      listed.begin(),
      listed.begin() + static_cast<std::ptrdiff_t>(std::min(listed.size(), kMostBearers)));
  paths.push_back(initialPathOf(modem));
  std::erase(paths, mm::kNoObject);
  return paths;
}

void readBearers(ModemPicture& picture, const BusObjects& objects, const BusInterfaces& modem) {
  const auto listed =
      busValue<std::vector<sdbus::ObjectPath>>(propertiesOf(modem, mm::kModem), "Bearers");
  if (!listed) return;
  picture.bearersUnread = listed->size() > kMostBearers;
  const std::string initial = initialPathOf(modem);
  std::vector<BearerReading> bearers;
  for (const std::string& path : bearerPathsOf(modem)) {
    const BusInterfaces& object = objectAt(objects, path);
    if (!object.contains(mm::kBearer)) return;
    if (path == initial && picture.technology != Technology::lte) continue;
    const BusProperties& properties = propertiesOf(object, mm::kBearer);
    if (!busValue<bool>(properties, "Connected")) picture.bearersUnread = true;
    auto bearer = bearerReading(properties);
    if (!bearer) continue;
    if (path == initial) {
      bearer = initialReading(std::move(*bearer), properties, modem);
      if (isAmong(bearers, *bearer)) continue;
    }
    bearers.push_back(std::move(*bearer));
  }
  picture.bearers = std::move(bearers);
}

}  // namespace qel::sources
