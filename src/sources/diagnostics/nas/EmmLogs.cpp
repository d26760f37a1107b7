#include "sources/diagnostics/nas/EmmLogs.h"

#include <algorithm>
#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/nas/EmmMessage.h"
#include "sources/diagnostics/nas/InformationElements.h"
#include "sources/diagnostics/nas/PlainMessage.h"
#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {
namespace {

// Values of RegistrationStatus.
constexpr std::int32_t kNormalService = 0;
constexpr std::int32_t kFailure = 1;
constexpr std::int32_t kLimitedService = 2;
constexpr std::int32_t kNoService = 3;
constexpr std::int32_t kNotRegistered = 4;
constexpr std::int32_t kDisabled = 5;
constexpr std::int32_t kDetached = 6;
constexpr std::int32_t kInProgress = 11;

// Values of EpsUpdateStatus.
constexpr std::int32_t kUpdated = 0;
constexpr std::int32_t kNotUpdated = 1;
constexpr std::int32_t kRoamingNotAllowed = 2;

// The modem's states and their substates, as 24.301, clause 5.1.3.2, has them.
constexpr std::uint8_t kDeregistered = 1;
constexpr std::uint8_t kRegistered = 3;
constexpr std::array kOfState = {kDisabled,   kNotRegistered, kInProgress, kNormalService,
                                 kInProgress, kNormalService, kDetached};
constexpr std::array kOfDeregistered = {kNotRegistered, kNotRegistered, kNotRegistered, kNoService,
                                        kNotRegistered, kNotRegistered, kLimitedService};
constexpr std::array kOfRegistered = {kNormalService, kNormalService, kInProgress,
                                      kNoService,     kNoService,     kLimitedService};

std::optional<std::int32_t> registrationOf(std::uint8_t state, std::uint32_t substate) {
  if (state == kDeregistered && substate < kOfDeregistered.size()) return kOfDeregistered[substate];
  if (state == kRegistered && substate < kOfRegistered.size()) return kOfRegistered[substate];
  // Of further substates there is no list; the state holds all the same.
  if (state < kOfState.size()) return kOfState[state];
  return std::nullopt;
}

enum class Forgets : std::uint8_t { never, whenAttaching, always };

// What a refusal does to the phone's registration (24.301, clauses 5.5.1.2.5, 5.5.3.2.5, 5.6.1.5).
struct RefusalRow {
  std::uint32_t cause;
  std::int32_t updateStatus;
  Forgets identity;
  std::vector<TrackingArea> CommonPart::*forbidden;
};
constexpr std::array kRefusals = {
    RefusalRow{3, kRoamingNotAllowed, Forgets::always, nullptr},
    RefusalRow{6, kRoamingNotAllowed, Forgets::always, nullptr},
    RefusalRow{7, kRoamingNotAllowed, Forgets::always, nullptr},
    RefusalRow{8, kRoamingNotAllowed, Forgets::always, nullptr},
    RefusalRow{9, kNotUpdated, Forgets::always, nullptr},
    RefusalRow{11, kRoamingNotAllowed, Forgets::always, nullptr},
    RefusalRow{12, kRoamingNotAllowed, Forgets::always, &CommonPart::noServiceTracking},
    RefusalRow{13, kRoamingNotAllowed, Forgets::whenAttaching, &CommonPart::noRoamingTracking},
    RefusalRow{14, kRoamingNotAllowed, Forgets::always, nullptr},
    RefusalRow{15, kRoamingNotAllowed, Forgets::whenAttaching, &CommonPart::noRoamingTracking},
    RefusalRow{25, kRoamingNotAllowed, Forgets::never, nullptr},
    RefusalRow{35, kRoamingNotAllowed, Forgets::always, nullptr},
};

// Where the phone is when a network refuses it.
std::optional<TrackingArea> servingTrackingArea(const Picture& picture) {
  const auto& cell = picture.lte.serving;
  if (!cell) return std::nullopt;
  return TrackingArea{plmnOf({cell->mcc, cell->mnc, cell->mncDigits}), cell->area};
}

void setRegistration(EmmPart& emm, std::int32_t status) {
  if (!emm.registrationIsModems) emm.registration = status;
}

void dropConnections(Picture& picture, Told& told, std::uint32_t keptMask) {
  auto& active = picture.nas.connections.active;
  if (!active) return;
  const auto dropped = std::erase_if(*active, [&](const PacketConnection& connection) {
    return (keptMask >> connection.nsapi & 1U) == 0;
  });
  if (dropped != 0) told.tell(metric::kBearers);
}

void takeRequest(const EmmMessage& message, Picture& picture, Told& told) {
  EmmPart& emm = picture.nas.emm;
  emm.procedure = message.procedure;
  emm.rejectCause.reset();
  if (message.type == EmmType::attachRequest) dropConnections(picture, told, 0);
  if (message.type == EmmType::attachRequest || message.type == EmmType::updateRequest) {
    setRegistration(emm, kInProgress);
  }
}

void takeFeatures(const EmmMessage& message, EmmPart& emm) {
  if (message.areas) emm.areas = *message.areas;
  if (message.identity) emm.identity = message.identity;
  if (message.longT3412) {
    emm.periodicUpdateS = longTimerS(*message.longT3412);
  } else if (message.t3412) {
    emm.periodicUpdateS = timerS(*message.t3412);
  }
  if (message.voice) emm.voiceOverIms = message.voice;
  if (message.emergency) emm.emergencyBearers = message.emergency;
}

void takeAccept(const EmmMessage& message, Picture& picture, Told& told) {
  EmmPart& emm = picture.nas.emm;
  CommonPart& common = picture.nas.common;
  if (message.type == EmmType::attachAccept) {
    emm.voiceOverIms.reset();
    emm.emergencyBearers.reset();
  }
  takeFeatures(message, emm);
  emm.rejectCause = message.cause.value_or(0);
  emm.updateStatus = kUpdated;
  setRegistration(emm, kNormalService);
  if (message.activeBearers) dropConnections(picture, told, *message.activeBearers);
  const std::size_t forbidden = common.noRoamingTracking.size() + common.noServiceTracking.size();
  for (const TrackingArea& area : emm.areas) {
    allow(common.noRoamingTracking, area);
    allow(common.noServiceTracking, area);
  }
  const bool freed = common.noRoamingTracking.size() + common.noServiceTracking.size() != forbidden;
  const bool hadEquivalents = common.equivalents && !common.equivalents->empty();
  if (message.equivalents || hadEquivalents) {
    common.equivalents = message.equivalents.value_or(std::vector<PlmnCode>{});
  }
  if (freed || message.equivalents || hadEquivalents) told.tell(metric::kMmCommonInfo);
}

void takeReject(const EmmMessage& message, Picture& picture, Told& told) {
  EmmPart& emm = picture.nas.emm;
  emm.rejectCause = message.cause;
  if (message.type != EmmType::serviceReject) {
    setRegistration(emm, kFailure);
    emm.updateStatus = kNotUpdated;
  }
  const auto row = std::ranges::find(kRefusals, message.cause.value_or(0), &RefusalRow::cause);
  if (row == kRefusals.end()) return;
  emm.updateStatus = row->updateStatus;
  const bool attaching = message.type == EmmType::attachReject;
  if (row->identity == Forgets::always || (row->identity == Forgets::whenAttaching && attaching)) {
    emm.identity.reset();
    emm.areas.clear();
  }
  const auto area = servingTrackingArea(picture);
  if (row->forbidden && area) {
    forbid(picture.nas.common.*row->forbidden, *area);
    told.tell(metric::kMmCommonInfo);
  }
}

void takeDetach(Picture& picture, Told& told) {
  setRegistration(picture.nas.emm, kDetached);
  dropConnections(picture, told, 0);
}

// Types of detaching (clause 9.9.3.7): the phone's second and the network's third are of
// circuit-switched service alone.
bool leavesLte(const EmmMessage& message, bool fromNetwork) {
  return message.detachType != (fromNetwork ? 3 : 2);
}

Outcome takeMessage(const LogPacket& packet, bool fromNetwork, Picture& picture, Told& told) {
  const PlainMessage plain = plainMessage(packet.body);
  if (plain.outcome != Outcome::understood) return plain.outcome;
  const auto message = readEmmMessage(plain.bytes);
  if (!message) return Outcome::damaged;
  switch (message->type) {
    case EmmType::other:
      return Outcome::notOurs;
    case EmmType::attachRequest:
    case EmmType::updateRequest:
    case EmmType::extendedServiceRequest:
    case EmmType::serviceRequest:
      takeRequest(*message, picture, told);
      break;
    case EmmType::attachAccept:
    case EmmType::updateAccept:
      takeAccept(*message, picture, told);
      break;
    case EmmType::attachReject:
    case EmmType::updateReject:
    case EmmType::serviceReject:
      takeReject(*message, picture, told);
      break;
    case EmmType::detachRequest:
      if (!leavesLte(*message, fromNetwork)) return Outcome::notOurs;
      takeDetach(picture, told);
      break;
    case EmmType::detachAccept:
      break;
    case EmmType::identityCommand:
      takeFeatures(*message, picture.nas.emm);
      break;
  }
  told.tell(metric::kEmmContext);
  return Outcome::understood;
}

}  // namespace

Outcome readEmmState(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::uint8_t kVersion = 2;
  constexpr std::size_t kLength = 19;
  const ByteView body = packet.body;
  if (body.empty()) return Outcome::damaged;
  if (body[0] != kVersion) return Outcome::unknownVersion;
  if (body.size() < kLength) return Outcome::damaged;
  const auto registration = registrationOf(body[1], u16At(body, 2));
  if (!registration) return Outcome::damaged;
  EmmPart& emm = picture.nas.emm;
  emm.registration = registration;
  emm.registrationIsModems = true;
  if (body[7] == 1) emm.identity = TemporaryIdentity{u16At(body, 12), body[14], u32At(body, 15)};
  told.tell(metric::kEmmContext);
  return Outcome::understood;
}

Outcome readEmmFromNetwork(const LogPacket& packet, Picture& picture, Told& told) {
  return takeMessage(packet, true, picture, told);
}

Outcome readEmmFromPhone(const LogPacket& packet, Picture& picture, Told& told) {
  return takeMessage(packet, false, picture, told);
}

}  // namespace qel::diagnostics
