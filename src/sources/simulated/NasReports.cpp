// Registration and packet connections.
#include "messages/nas.h"
#include "messages/runtime/MessageReader.h"
#include "sources/simulated/Bcd.h"
#include "sources/simulated/Identities.h"
#include "sources/simulated/Reports.h"

namespace qel::sources {
namespace {

constexpr std::uint32_t kPeriodicUpdateS = 3240;    // T3412, T3312 (24.008, table 11.3)
constexpr std::uint32_t kPeriodicLocationS = 3600;  // T3212
// Areas of a neighbouring country's network where this subscriber may not roam.
constexpr std::uint32_t kForbiddenArea = 0x2001;
constexpr std::uint32_t kForbiddenMnc = 2;

// Of the ranges kept for documentation (RFC 5737, RFC 3849).
constexpr std::uint8_t kOwnHost = 17;
constexpr std::uint8_t kDnsHost = 53;
constexpr std::uint8_t kSecondDnsHost = 54;

Bytes addressV4(std::uint8_t host) { return {192, 0, 2, host}; }
Bytes addressV6(std::uint8_t subnet, std::uint8_t host) {
  return {0x20, 0x01, 0x0D, 0xB8, 0, subnet, 0, 0, 0, 0, 0, 0, 0, 0, 0, host};
}

Bytes plmn() { return encodedPlmn(kMcc, kMnc, kMncDigits); }

std::int32_t statusOf(const PhoneView& view) {
  return view.phone.registration().inProgress() ? kRegInProgress : kRegNormalService;
}

std::shared_ptr<BearerContext> internet(const PhoneView& view) {
  const bool onLte = view.on(Technology::lte);
  auto bearer = makeMessage<BearerContext>();
  bearer->setCid(1);
  bearer->setNsapi(5);
  bearer->setApn("internet");
  bearer->setPdpType(onLte ? kPdpIPv4v6Lte : kPdpIPv4v6);
  // Interface identifier first, then the IPv4 address, as a connection of both has it (24.301,
  // clause 9.9.4.9).
  Bytes both = addressV6(1, 0x17);
  both.erase(both.begin(), both.begin() + 8);
  const Bytes address = addressV4(kOwnHost);
  both.insert(both.end(), address.begin(), address.end());
  bearer->setPdpAddr(std::move(both));
  bearer->setPrimaryDnsType(kPdpIPv4);
  bearer->setPrimaryDnsAddr(addressV4(kDnsHost));
  bearer->setSecondaryDnsType(kPdpIPv6);
  bearer->setSecondaryDnsAddr(addressV6(0, 0x53));
  bearer->setIsAddrIratMobile(true);
  return bearer;
}

std::shared_ptr<BearerContext> voice() {
  auto bearer = makeMessage<BearerContext>();
  bearer->setCid(2);
  bearer->setNsapi(6);
  bearer->setApn("ims");
  bearer->setPdpType(kPdpIPv6Lte);
  bearer->setPdpAddr(addressV6(2, 0x17));
  bearer->setPrimaryDnsType(kPdpIPv6);
  bearer->setPrimaryDnsAddr(addressV6(0, 0x53));
  bearer->setSecondaryDnsType(kPdpIPv6);
  bearer->setSecondaryDnsAddr(addressV6(0, 0x54));
  bearer->setIsAddrIratMobile(false);
  return bearer;
}

// Pictures and the like, over a network of IPv4 alone.
std::shared_ptr<BearerContext> messaging() {
  auto bearer = makeMessage<BearerContext>();
  bearer->setCid(3);
  bearer->setNsapi(7);
  bearer->setApn("mms");
  bearer->setPdpType(kPdpIPv4);
  bearer->setPdpAddr(Bytes{192, 0, 2, 118});
  bearer->setPrimaryDnsType(kPdpIPv4);
  bearer->setPrimaryDnsAddr(addressV4(kDnsHost));
  bearer->setSecondaryDnsType(kPdpIPv4);
  bearer->setSecondaryDnsAddr(addressV4(kSecondDnsHost));
  bearer->setIsAddrIratMobile(true);
  return bearer;
}

}  // namespace

std::optional<Bytes> mmCommonInfo(const PhoneView&, std::uint64_t timeMs) {
  KCellularMmCommonInfo message;
  message.setTimestamp(timeMs);
  message.setImsi(encodedImsi(kImsi));
  auto own = makeMessage<Plmn>();
  own->setEncodedPlmn(plmn());
  message.addEplmnList(own);
  auto locationArea = makeMessage<KCellularLocationAreaId>();
  locationArea->setEncodedPlmn(encodedPlmn(kMcc, kForbiddenMnc, kMncDigits));
  locationArea->setLac(kForbiddenArea);
  message.addRoamingFlaiList(locationArea);
  auto trackingArea = makeMessage<KCellularTrackingAreaId>();
  trackingArea->setEncodedPlmn(encodedPlmn(kMcc, kForbiddenMnc, kMncDigits));
  trackingArea->setTac(kForbiddenArea);
  message.addRoamingFtaiList(trackingArea);
  return message.data();
}

std::optional<Bytes> mmContext(const PhoneView& view, std::uint64_t timeMs) {
  const Registration& registration = view.phone.registration();
  auto area = makeMessage<KCellularLocationAreaId>();
  area->setEncodedPlmn(plmn());
  area->setLac(registration.locationArea());
  KCellularMmContext message;
  message.setTimestamp(timeMs);
  message.setRegStatus(statusOf(view));
  message.setUpdateStatus(registration.inProgress() ? kMmNotUpdated : kMmUpdated);
  message.setLai(area);
  message.setTmsi(registration.tmsi());
  message.setT3212DurS(kPeriodicLocationS);
  message.setProcFailureCause(0);
  message.setRejectCause(0);
  message.setIsCombinedProc(true);
  return message.data();
}

std::optional<Bytes> gmmContext(const PhoneView& view, std::uint64_t timeMs) {
  const Registration& registration = view.phone.registration();
  // On LTE this domain rests with what it last knew.
  const bool resting = view.on(Technology::lte);
  auto area = makeMessage<RoutingAreaId>();
  area->setEncodedPlmn(plmn());
  area->setLac(registration.locationArea());
  area->setRac(registration.routingArea());
  KCellularGmmContext message;
  message.setTimestamp(timeMs);
  message.setRegStatus(resting ? kRegNoService : statusOf(view));
  message.setUpdateStatus(!resting && registration.inProgress() ? kPacketNotUpdated
                                                                : kPacketUpdated);
  message.setRai(area);
  message.setPTmsi(registration.pTmsi());
  message.setT3312DurS(kPeriodicUpdateS);
  message.setProcFailureCause(0);
  message.setRejectCause(0);
  message.setRegProc(resting ? kGmmNone : registration.gmmProcedure());
  return message.data();
}

std::optional<Bytes> emmContext(const PhoneView& view, std::uint64_t timeMs) {
  if (!view.on(Technology::lte)) return std::nullopt;
  const Registration& registration = view.phone.registration();
  KCellularEmmContext message;
  message.setTimestamp(timeMs);
  message.setRegStatus(statusOf(view));
  message.setUpdateStatus(registration.inProgress() ? kPacketNotUpdated : kPacketUpdated);
  message.setUeOpMode(kEmmCsPsMode1);
  for (const std::uint32_t area : registration.trackingAreas()) {
    auto trackingArea = makeMessage<KCellularTrackingAreaId>();
    trackingArea->setEncodedPlmn(plmn());
    trackingArea->setTac(area);
    message.addTaiList(trackingArea);
  }
  auto guti = makeMessage<Guti>();
  guti->setMmegi(kMmeGroup);
  guti->setMmec(kMmeCode);
  guti->setMTmsi(registration.mTmsi());
  message.setGuti(guti);
  message.setRejectCause(0);
  message.setRegProc(registration.emmProcedure());
  message.setT3412DurS(kPeriodicUpdateS);
  message.setIsImsVoiceSupported(true);
  message.setIsEmergBearerSupported(true);
  return message.data();
}

std::optional<Bytes> bearers(const PhoneView& view, std::uint64_t timeMs) {
  MessageList<BearerContext> active = {internet(view)};
  if (view.on(Technology::lte)) active.push_back(voice());
  if (view.on(Technology::umts) && view.phone.connection().connected()) {
    active.push_back(messaging());
  }
  KCellularActivatedBearerContexts message;
  message.setTimestamp(timeMs);
  message.setBearerContextCount(static_cast<std::uint32_t>(active.size()));
  message.setBearerContexts(std::move(active));
  return message.data();
}

}  // namespace qel::sources
