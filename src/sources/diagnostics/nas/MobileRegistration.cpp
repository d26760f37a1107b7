#include "sources/diagnostics/nas/MobileRegistration.h"

#include <algorithm>

#include "sources/Metrics.h"
#include "sources/diagnostics/nas/MobileCodes.h"
#include "sources/diagnostics/nas/PacketContexts.h"

namespace qel::diagnostics {
namespace {

// Causes that forbid a location area, and those that end the phone's right to roam.
constexpr std::uint8_t kAreaNotAllowed = 12;
constexpr std::uint8_t kRoamingNotAllowed = 13;
constexpr std::uint8_t kNoSuitableCell = 15;
constexpr std::uint8_t kRoamingCauses[] = {
    2, 3, 6, 11, kAreaNotAllowed, kRoamingNotAllowed, kNoSuitableCell};
constexpr std::uint8_t kPacketRoamingCauses[] = {
    3, 6, 7, 8, 11, kAreaNotAllowed, kRoamingNotAllowed, 14, kNoSuitableCell};

template <class Causes>
bool isAmong(const Causes& causes, std::uint8_t cause) {
  return std::ranges::find(causes, cause) != std::end(causes);
}

// All of 48 to 63 mean the same (24.008, clause 10.5.3.6, note).
std::int32_t reportedCause(std::uint8_t cause) {
  constexpr std::uint8_t kFirst = 48;
  constexpr std::uint8_t kRetryInNewCell = 63;
  return cause >= kFirst && cause < kRetryInNewCell ? kRetryInNewCell : cause;
}

// Where the phone is when a network refuses it.
std::optional<LocationArea> areaNow(const Picture& picture) {
  if (picture.technology == Technology::gsm && picture.gsm.cell) return picture.gsm.cell->area;
  const auto& umts = picture.umts.cell;
  if (picture.technology == Technology::umts && umts && umts->network) {
    return LocationArea{plmnOf(*umts->network), umts->areaCode};
  }
  return std::nullopt;
}

void forbidHere(std::uint8_t cause, Picture& picture, Told& told) {
  const auto area = areaNow(picture);
  if (!area) return;
  CommonPart& common = picture.nas.common;
  if (cause == kAreaNotAllowed) {
    forbid(common.noService, *area);
  } else if (cause == kRoamingNotAllowed || cause == kNoSuitableCell) {
    forbid(common.noRoaming, *area);
  } else {
    return;
  }
  told.tell(metric::kMmCommonInfo);
}

// The network serves the phone there; with that it names the equivalents of itself.
void welcome(const LocationArea& area, const std::vector<PlmnCode>& equivalents, Picture& picture,
             Told& told) {
  CommonPart& common = picture.nas.common;
  const std::size_t before = common.noRoaming.size() + common.noService.size();
  allow(common.noRoaming, area);
  allow(common.noService, area);
  const bool freed = common.noRoaming.size() + common.noService.size() != before;
  if (freed || common.equivalents != equivalents) told.tell(metric::kMmCommonInfo);
  common.equivalents = equivalents;
}

void setIdentity(const std::optional<GivenIdentity>& identity, MmPart& mm) {
  if (identity) mm.tmsi = identity->tmsi;
}

void setAccepted(const LocationArea& area, MmPart& mm) {
  mm.registration = kRegisteredNormal;
  mm.updateStatus = kMmUpdated;
  mm.area = area;
  mm.failureCause = kNoFailure;
  mm.rejectCause = 0;
}

void setRejected(std::uint8_t cause, MmPart& mm) {
  mm.registration = kRegistrationFailed;
  mm.updateStatus = isAmong(kRoamingCauses, cause) ? kMmRoamingNotAllowed : kMmNotUpdated;
  mm.failureCause = kRejectedByNetwork;
  mm.rejectCause = reportedCause(cause);
}

// Which procedure it was, for one domain or for both.
struct Procedures {
  MobileProcedure alone;
  MobileProcedure combined;
};

void takePacketAccept(const PacketAccept& accept, const Procedures& procedures, Picture& picture,
                      Told& told) {
  GmmPart& gmm = picture.nas.gmm;
  MmPart& mm = picture.nas.mm;
  // What the phone asked for, where that was seen.
  if (gmm.procedure != procedures.alone && gmm.procedure != procedures.combined) {
    gmm.procedure = accept.combined ? procedures.combined : procedures.alone;
  }
  gmm.registration = kRegisteredNormal;
  gmm.updateStatus = kGmmUpdated;
  gmm.area = accept.area;
  gmm.periodicUpdateS = accept.t3312S;
  if (accept.pTmsi) gmm.pTmsi = accept.pTmsi;
  gmm.failureCause = kNoFailure;
  gmm.rejectCause = 0;
  told.tell(metric::kGmmContext);
  if (accept.combined) {
    setAccepted(accept.area.location, mm);
    setIdentity(accept.identity, mm);
  } else if (accept.cause) {
    setRejected(*accept.cause, mm);
  }
  if (accept.combined || accept.cause) told.tell(metric::kMmContext);
  welcome(accept.area.location, accept.equivalents, picture, told);
}

void beginPacketProcedure(MobileProcedure procedure, bool combined, Picture& picture, Told& told) {
  picture.nas.gmm.procedure = procedure;
  picture.nas.gmm.registration = kRegistering;
  told.tell(metric::kGmmContext);
  if (!combined) return;
  picture.nas.mm.combined = true;
  told.tell(metric::kMmContext);
}

}  // namespace

void takeLocationRequest(Picture& picture, Told& told) {
  picture.nas.mm.registration = kRegistering;
  picture.nas.mm.combined = false;
  told.tell(metric::kMmContext);
}

void takeLocationAccept(const LocationAccept& accept, Picture& picture, Told& told) {
  MmPart& mm = picture.nas.mm;
  setAccepted(accept.area, mm);
  setIdentity(accept.identity, mm);
  mm.periodicUpdateS = accept.t3212S;
  told.tell(metric::kMmContext);
  welcome(accept.area, accept.equivalents, picture, told);
}

void takeLocationReject(std::uint8_t cause, Picture& picture, Told& told) {
  setRejected(cause, picture.nas.mm);
  told.tell(metric::kMmContext);
  forbidHere(cause, picture, told);
}

void takeNewTmsi(const LocationAccept& given, Picture& picture, Told& told) {
  picture.nas.mm.area = given.area;
  setIdentity(given.identity, picture.nas.mm);
  told.tell(metric::kMmContext);
}

void takeImsiDetach(Picture& picture, Told& told) {
  picture.nas.mm.registration = kServiceDetached;
  told.tell(metric::kMmContext);
}

void takeAuthenticationReject(Picture& picture, Told& told) {
  MmPart& mm = picture.nas.mm;
  mm.registration = kRegistrationFailed;
  mm.updateStatus = kMmRoamingNotAllowed;
  mm.failureCause = kAuthenticationRejected;
  told.tell(metric::kMmContext);
}

void takeAttachRequest(std::uint8_t type, Picture& picture, Told& told) {
  constexpr std::uint8_t kCombined = 3;
  const bool combined = type == kCombined;
  beginPacketProcedure(combined ? kCombinedAttach : kAttach, combined, picture, told);
}

void takeAttachAccept(const PacketAccept& accept, Picture& picture, Told& told) {
  takePacketAccept(accept, {kAttach, kCombinedAttach}, picture, told);
}

void takeUpdateRequest(std::uint8_t type, Picture& picture, Told& told) {
  const bool combined = type == 1 || type == 2;  // 2: the phone attaches to the other domain
  beginPacketProcedure(combined ? kCombinedUpdate : kRoutingAreaUpdate, combined, picture, told);
}

void takeUpdateAccept(const PacketAccept& accept, Picture& picture, Told& told) {
  takePacketAccept(accept, {kRoutingAreaUpdate, kCombinedUpdate}, picture, told);
}

void takePacketReject(std::uint8_t cause, Picture& picture, Told& told) {
  GmmPart& gmm = picture.nas.gmm;
  gmm.registration = kRegistrationFailed;
  gmm.updateStatus = isAmong(kPacketRoamingCauses, cause) ? kGmmRoamingNotAllowed : kGmmNotUpdated;
  gmm.failureCause = kRejectedByNetwork;
  gmm.rejectCause = reportedCause(cause);
  told.tell(metric::kGmmContext);
  forbidHere(cause, picture, told);
}

void takePhonesDetach(std::uint8_t type, Picture& picture, Told& told) {
  constexpr std::uint8_t kPackets = 1;
  constexpr std::uint8_t kCalls = 2;
  const std::uint8_t domains = type & 3;
  if ((domains & kCalls) != 0) takeImsiDetach(picture, told);
  if ((domains & kPackets) == 0) return;
  picture.nas.gmm.registration = kServiceDetached;
  told.tell(metric::kGmmContext);
  endAllContexts(picture, told);
}

void takeNetworksDetach(std::uint8_t type, Picture& picture, Told& told) {
  constexpr std::uint8_t kCallsOnly = 3;
  if ((type & 7) == kCallsOnly) return;
  picture.nas.gmm.procedure = kNetworkDetach;
  picture.nas.gmm.registration = kServiceDetached;
  told.tell(metric::kGmmContext);
  endAllContexts(picture, told);
}

void takeServiceRequest(Picture& picture, Told& told) {
  picture.nas.gmm.procedure = kServiceRequest;
  told.tell(metric::kGmmContext);
}

void takeServiceAccept(Picture& picture, Told& told) {
  GmmPart& gmm = picture.nas.gmm;
  gmm.registration = kRegisteredNormal;
  gmm.failureCause = kNoFailure;
  gmm.rejectCause = 0;
  told.tell(metric::kGmmContext);
}

void takePacketAuthenticationReject(Picture& picture, Told& told) {
  GmmPart& gmm = picture.nas.gmm;
  gmm.registration = kRegistrationFailed;
  gmm.updateStatus = kGmmRoamingNotAllowed;
  gmm.failureCause = kAuthenticationRejected;
  told.tell(metric::kGmmContext);
}

}  // namespace qel::diagnostics
