// Registration, subscriber and packet connections of a modem.
#include <algorithm>
#include <array>

#include "messages/nas.h"
#include "messages/runtime/MessageReader.h"
#include "sources/Filling.h"
#include "sources/modem_manager/CellFilling.h"
#include "sources/modem_manager/ModemReports.h"
#include "sources/modem_manager/Names.h"
#include "sources/simulated/Bcd.h"
#include "sources/simulated/WireCodes.h"

namespace qel::sources {
namespace {

// RegistrationStatus of the messages, those that WireCodes.h has no name for.
constexpr std::int32_t kRegFailure = 1;
constexpr std::int32_t kRegNotRegistered = 4;
constexpr std::int32_t kRegDetached = 6;
constexpr std::int32_t kRegEmergency = 8;
constexpr std::int32_t kRegSmsOnly = 10;

struct RegistrationRow {
  std::uint32_t state;
  std::int32_t status;
  bool registered;
};

// What is not here is not known, and nothing is reported.
constexpr std::array kRegistrations = {
    RegistrationRow{mm::kIdle, kRegNotRegistered, false},
    RegistrationRow{mm::kHome, kRegNormalService, true},
    RegistrationRow{mm::kSearching, kRegInProgress, false},
    RegistrationRow{mm::kDenied, kRegFailure, false},
    RegistrationRow{mm::kRoaming, kRegNormalService, true},
    RegistrationRow{mm::kHomeSmsOnly, kRegSmsOnly, true},
    RegistrationRow{mm::kRoamingSmsOnly, kRegSmsOnly, true},
    RegistrationRow{mm::kEmergencyOnly, kRegEmergency, false},
    RegistrationRow{mm::kHomeNoFallback, kRegNormalService, true},
    RegistrationRow{mm::kRoamingNoFallback, kRegNormalService, true},
};

// The modem has one state for all domains. Registered is the domain of the technology in use; not
// registered are all of them.
const RegistrationRow* registrationIn(const ModemPicture& modem, bool onLte) {
  const auto row = std::ranges::find_if(
      kRegistrations, [&](const RegistrationRow& r) { return modem.registration == r.state; });
  if (row == kRegistrations.end()) return nullptr;
  if (!modem.technology) return row->status == kRegEmergency || row->registered ? nullptr : &*row;
  return (modem.technology == Technology::lte) == onLte ? &*row : nullptr;
}

Bytes encoded(const NetworkCode& network) {
  return encodedPlmn(network.mcc, network.mnc, network.mncDigits);
}

// Where the phone is registered: the area of its serving cell.
template <class Area>
std::shared_ptr<Area> areaOf(const ModemPicture& modem, const RegistrationRow& row) {
  if (!row.registered || !modem.serving) return nullptr;
  const CellReading& cell = *modem.serving;
  if (!cell.area || !cell.network) return nullptr;
  auto area = makeMessage<Area>();
  area->setEncodedPlmn(encoded(*cell.network));
  area->setLac(*cell.area);
  return area;
}

// As the connection of LTE its numbers begin three higher (PDP_TYPE_IPv4_PDN).
std::optional<std::int32_t> pdpTypeOf(const BearerReading& bearer, bool onLte) {
  const bool both = bearer.uses4 && bearer.uses6;
  if (!bearer.uses4 && !bearer.uses6) return std::nullopt;
  const std::int32_t type = both ? kPdpIPv4v6 : bearer.uses6 ? kPdpIPv6 : kPdpIPv4;
  return onLte ? type + (kPdpIPv6Lte - kPdpIPv6) : type;
}

// With both, the interface identifier comes before the IPv4 address (24.301, clause 9.9.4.9).
// Nothing while one of them is not known.
Bytes pdpAddressOf(const BearerReading& bearer) {
  if (bearer.uses4 != bearer.uses6) return bearer.uses4 ? bearer.address4 : bearer.address6;
  if (bearer.address4.empty() || bearer.address6.empty()) return {};
  Bytes both(bearer.address6.begin() + 8, bearer.address6.end());
  both.insert(both.end(), bearer.address4.begin(), bearer.address4.end());
  return both;
}

std::int32_t addressType(const Bytes& address) { return address.size() == 4 ? kPdpIPv4 : kPdpIPv6; }

std::shared_ptr<BearerContext> contextOf(const BearerReading& bearer, bool onLte) {
  auto context = makeMessage<BearerContext>();
  if (bearer.profile != 0) context->setCid(bearer.profile);
  if (!bearer.apn.empty()) context->setApn(bearer.apn);
  if (const auto type = pdpTypeOf(bearer, onLte)) context->setPdpType(*type);
  if (Bytes address = pdpAddressOf(bearer); !address.empty()) {
    context->setPdpAddr(std::move(address));
  }
  const auto& servers = bearer.nameServers;
  if (!servers.empty()) {
    context->setPrimaryDnsType(addressType(servers[0]));
    context->setPrimaryDnsAddr(servers[0]);
  }
  if (servers.size() > 1) {
    context->setSecondaryDnsType(addressType(servers[1]));
    context->setSecondaryDnsAddr(servers[1]);
  }
  return context;
}

// Of the domain whose registration was refused; nothing once there is one.
std::optional<std::int32_t> rejectCauseOf(const ModemPicture& modem, const RegistrationRow& row,
                                          bool onLte) {
  if (row.registered || !modem.rejection) return std::nullopt;
  const auto technology =
      modem.rejection->technology ? modem.rejection->technology : modem.technology;
  if (!technology || (*technology == Technology::lte) != onLte) return std::nullopt;
  return static_cast<std::int32_t>(modem.rejection->cause);
}

}  // namespace

std::optional<Bytes> modemEmmContext(const ModemPicture& modem, std::uint64_t timeMs) {
  const RegistrationRow* row = registrationIn(modem, true);
  if (!row) return std::nullopt;
  KCellularEmmContext message;
  message.setTimestamp(timeMs);
  message.setRegStatus(row->status);
  set(message, &KCellularEmmContext::setRejectCause, rejectCauseOf(modem, *row, true));
  return message.data();
}

std::optional<Bytes> modemMmContext(const ModemPicture& modem, std::uint64_t timeMs) {
  const RegistrationRow* row = registrationIn(modem, false);
  if (!row) return std::nullopt;
  KCellularMmContext message;
  message.setTimestamp(timeMs);
  message.setRegStatus(row->status);
  if (auto area = areaOf<KCellularLocationAreaId>(modem, *row)) message.setLai(area);
  set(message, &KCellularMmContext::setRejectCause, rejectCauseOf(modem, *row, false));
  return message.data();
}

std::optional<Bytes> modemGmmContext(const ModemPicture& modem, std::uint64_t timeMs) {
  const RegistrationRow* row = registrationIn(modem, false);
  if (!row) return std::nullopt;
  // Registered may be the other domain alone.
  const bool detached = row->registered && modem.packetService == mm::kDetached;
  if (row->registered && !detached && modem.packetService != mm::kAttached) return std::nullopt;
  KCellularGmmContext message;
  message.setTimestamp(timeMs);
  message.setRegStatus(detached ? kRegDetached : row->status);
  if (!detached) {
    if (auto area = areaOf<RoutingAreaId>(modem, *row)) message.setRai(area);
  }
  set(message, &KCellularGmmContext::setRejectCause, rejectCauseOf(modem, *row, false));
  return message.data();
}

std::optional<Bytes> modemMmCommonInfo(const ModemPicture& modem, std::uint64_t timeMs) {
  if (modem.sim.imsi.empty()) return std::nullopt;
  KCellularMmCommonInfo message;
  message.setTimestamp(timeMs);
  message.setImsi(encodedImsi(modem.sim.imsi));
  return message.data();
}

std::optional<Bytes> modemBearers(const ModemPicture& modem, std::uint64_t timeMs) {
  if (!modem.bearers || (modem.bearers->empty() && modem.bearersUnread)) return std::nullopt;
  KCellularActivatedBearerContexts message;
  message.setTimestamp(timeMs);
  if (!modem.bearersUnread) {
    message.setBearerContextCount(static_cast<std::uint32_t>(modem.bearers->size()));
  }
  for (const BearerReading& bearer : *modem.bearers) {
    message.addBearerContexts(contextOf(bearer, modem.technology == Technology::lte));
  }
  return message.data();
}

}  // namespace qel::sources
