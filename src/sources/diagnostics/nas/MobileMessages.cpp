#include "sources/diagnostics/nas/MobileMessages.h"

#include <array>

#include "sources/diagnostics/nas/EpsElements.h"
#include "sources/diagnostics/nas/InformationElements.h"
#include "sources/diagnostics/nas/PdpAddress.h"

namespace qel::diagnostics {
namespace {

// Identifiers of elements.
constexpr std::uint8_t kMobileIdentity = 0x17;
constexpr std::uint8_t kPacketTmsi = 0x18;
constexpr std::uint8_t kMobileIdentityOfPackets = 0x23;
constexpr std::uint8_t kCauseOfPackets = 0x25;
constexpr std::uint8_t kProtocolOptions = 0x27;
constexpr std::uint8_t kAccessPoint = 0x28;
constexpr std::uint8_t kPacketAddress = 0x2B;
constexpr std::uint8_t kOwnT3212 = 0x35;
constexpr std::uint8_t kLongT3312 = 0x39;
constexpr std::uint8_t kEquivalents = 0x4A;

// Of attach and update accepts: ready timer, signature, cause.
constexpr std::array kFixedOfPackets = {FixedElement{0x17, 1}, FixedElement{0x19, 3},
                                        FixedElement{kCauseOfPackets, 1}};

// Clause 10.5.1.4.
std::optional<GivenIdentity> givenIdentity(ByteView value) {
  constexpr std::uint8_t kTmsi = 4;
  constexpr std::size_t kTmsiOctets = 5;
  if (value.empty()) return std::nullopt;
  if ((value[0] & 7) != kTmsi) return GivenIdentity{};
  if (value.size() < kTmsiOctets) return std::nullopt;
  std::uint32_t tmsi = 0;
  for (const std::uint8_t octet : value.subspan(1, 4)) tmsi = tmsi << 8 | octet;
  return GivenIdentity{tmsi};
}

std::optional<LocationArea> readArea(ElementReader& reader) {
  const ByteView value = reader.value(kLocationAreaBytes);
  if (value.empty()) return std::nullopt;
  const LocationArea area = locationAreaAt(value, 0);
  return networkOf(area.plmn) ? std::optional(area) : std::nullopt;
}

std::vector<PlmnCode> equivalentsOf(ByteView value) {
  return networkList(value).value_or(std::vector<PlmnCode>{});
}

// From the timer on, which both accepts have in common behind their second octet.
bool readPacketOptions(ElementReader& reader, PacketAccept& accept) {
  OptionalElements options(reader.rest(), Protocol::gsmAndUmts, kFixedOfPackets);
  while (const auto element = options.next()) {
    const ByteView value = element->value;
    if (element->identifier == kPacketTmsi) {
      const auto identity = givenIdentity(value);
      if (identity) accept.pTmsi = identity->tmsi;
    } else if (element->identifier == kMobileIdentityOfPackets) {
      accept.identity = givenIdentity(value);
    } else if (element->identifier == kCauseOfPackets) {
      accept.cause = value[0];
    } else if (element->identifier == kEquivalents) {
      accept.equivalents = equivalentsOf(value);
    } else if (element->identifier == kLongT3312 && !value.empty()) {
      accept.t3312S = longTimerS(value[0]);
    }
  }
  return !options.failed();
}

bool readRoutingArea(ElementReader& reader, PacketAccept& accept) {
  const ByteView area = reader.value(kRoutingAreaBytes);
  if (area.empty()) return false;
  accept.area = routingAreaAt(area, 0);
  return networkOf(accept.area.location.plmn).has_value();
}

}  // namespace

std::optional<LocationAccept> readLocationAccept(ByteView body) {
  ElementReader reader(body);
  const auto area = readArea(reader);
  if (!area) return std::nullopt;
  LocationAccept accept;
  accept.area = *area;
  OptionalElements options(reader.rest(), Protocol::gsmAndUmts, {});
  while (const auto element = options.next()) {
    const ByteView value = element->value;
    if (element->identifier == kMobileIdentity) {
      accept.identity = givenIdentity(value);
    } else if (element->identifier == kEquivalents) {
      accept.equivalents = equivalentsOf(value);
    } else if (element->identifier == kOwnT3212 && !value.empty()) {
      accept.t3212S = longTimerS(value[0]);
    }
  }
  return options.failed() ? std::nullopt : std::optional(accept);
}

std::optional<LocationAccept> readNewTmsi(ByteView body) {
  ElementReader reader(body);
  const auto area = readArea(reader);
  const ByteView identity = reader.counted();
  if (!area || reader.failed()) return std::nullopt;
  LocationAccept accept;
  accept.area = *area;
  accept.identity = givenIdentity(identity);
  return accept;
}

std::optional<PacketAccept> readAttachAccept(ByteView body) {
  constexpr std::uint8_t kCombined = 3;
  ElementReader reader(body);
  PacketAccept accept;
  accept.combined = (reader.octet() & 7) == kCombined;
  accept.t3312S = timerS(reader.octet());
  reader.octet();  // radio priorities
  if (!readRoutingArea(reader, accept) || !readPacketOptions(reader, accept)) return std::nullopt;
  return accept;
}

std::optional<PacketAccept> readUpdateAccept(ByteView body) {
  ElementReader reader(body);
  PacketAccept accept;
  // 1, or 5 where the phone is known to LTE as well
  accept.combined = (reader.octet() >> 4 & 3) == 1;
  accept.t3312S = timerS(reader.octet());
  if (!readRoutingArea(reader, accept) || !readPacketOptions(reader, accept)) return std::nullopt;
  return accept;
}

std::optional<std::uint8_t> readAttachType(ByteView body) {
  ElementReader reader(body);
  reader.counted();  // what the phone can do
  const std::uint8_t type = reader.octet() & 7;
  return reader.failed() ? std::nullopt : std::optional(type);
}

std::optional<std::uint8_t> readUpdateType(ByteView body) {
  if (body.empty()) return std::nullopt;
  return static_cast<std::uint8_t>(body[0] & 7);
}

std::optional<PacketConnection> readActivateRequest(ByteView body) {
  constexpr std::uint8_t kLeastNsapi = 5;
  ElementReader reader(body);
  const std::uint8_t nsapi = reader.octet() & 0xF;
  reader.octet();    // service access point
  reader.counted();  // quality of service
  const ByteView address = reader.counted();
  if (reader.failed() || nsapi < kLeastNsapi) return std::nullopt;
  PacketConnection connection;
  connection.nsapi = nsapi;
  if (const auto read = pdpAddress(address)) connection.type = read->type;
  OptionalElements options(reader.rest(), Protocol::gsmAndUmts, {});
  while (const auto element = options.next()) {
    if (element->identifier == kAccessPoint) {
      connection.apn = accessPointName(element->value).value_or(std::string());
    }
  }
  return options.failed() ? std::nullopt : std::optional(connection);
}

std::optional<ActivateAccept> readActivateAccept(ByteView body) {
  ElementReader reader(body);
  reader.octet();    // service access point
  reader.counted();  // quality of service
  reader.octet();    // radio priority
  if (reader.failed()) return std::nullopt;
  ActivateAccept accept;
  OptionalElements options(reader.rest(), Protocol::gsmAndUmts, {});
  while (const auto element = options.next()) {
    if (element->identifier == kPacketAddress) {
      if (auto read = pdpAddress(element->value)) {
        accept.type = read->type;
        accept.address = std::move(read->address);
      }
    } else if (element->identifier == kProtocolOptions) {
      accept.nameServers = nameServers(element->value).value_or(std::vector<Bytes>{});
    }
  }
  return options.failed() ? std::nullopt : std::optional(std::move(accept));
}

}  // namespace qel::diagnostics
