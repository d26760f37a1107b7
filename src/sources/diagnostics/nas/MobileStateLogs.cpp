// What the modem says of its registration in its own words.
#include <algorithm>
#include <array>

#include "sources/Metrics.h"
#include "sources/diagnostics/nas/MobileCodes.h"
#include "sources/diagnostics/nas/MobileLogs.h"
#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {
namespace {

// By state.
constexpr std::array kOfGmmState = {kRegistrationDisabled, kNotRegisteredYet, kRegistering,
                                    kRegisteredNormal,     kServiceDetached,  kRegistering,
                                    kRegisteredNormal};

struct MmRow {
  std::uint8_t state;
  MobileRegistration registration;
};
// 24.008, table 4.1.2.1. Of states that are not here the registration stays as it was.
constexpr std::uint8_t kMmIdle = 19;
constexpr MmRow kOfMmState[] = {
    {0, kRegistrationDisabled}, {3, kRegistering},  {7, kServiceDetached},
    {10, kRegistrationFailed},  {13, kRegistering}, {15, kServiceDetached},
};
// When idle, by the modem's own number of the substate.
constexpr MmRow kOfMmSubstate[] = {
    {1, kRegisteredLimited}, {2, kWithoutService}, {3, kRegisteredLimited},
    {4, kNotRegisteredYet},  {6, kWithoutService}, {8, kRegisteredNormal},
};

template <std::size_t size>
std::optional<std::int32_t> registrationOf(const MmRow (&rows)[size], std::uint8_t state) {
  const auto row = std::ranges::find(rows, state, &MmRow::state);
  return row == std::end(rows) ? std::nullopt : std::optional<std::int32_t>(row->registration);
}

// What no network sends: a deleted area (23.003, clause 4.1).
bool isArea(const LocationArea& area) {
  constexpr std::uint32_t kDeleted = 0xFFFE;
  return networkOf(area.plmn) && area.lac != 0 && area.lac < kDeleted;
}

}  // namespace

Outcome readGmmState(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 3;
  constexpr std::uint8_t kMostStatus = 3;
  const ByteView body = packet.body;
  if (body.size() < kBytes) return Outcome::damaged;
  if (body[0] >= kOfGmmState.size() || body[2] > kMostStatus) return Outcome::damaged;
  GmmPart& gmm = picture.nas.gmm;
  gmm.registration = kOfGmmState[body[0]];
  gmm.updateStatus = std::min<std::int32_t>(body[2], kGmmRoamingNotAllowed);
  told.tell(metric::kGmmContext);
  return Outcome::understood;
}

Outcome readMmState(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 3;
  const ByteView body = packet.body;
  if (body.size() < kBytes) return Outcome::damaged;
  if (body[2] >= kMmRoamingNotAllowed) return Outcome::damaged;
  const auto registration = body[0] == kMmIdle ? registrationOf(kOfMmSubstate, body[1])
                                               : registrationOf(kOfMmState, body[0]);
  MmPart& mm = picture.nas.mm;
  if (registration) mm.registration = registration;
  mm.updateStatus = body[2] + kMmUpdated;
  told.tell(metric::kMmContext);
  return Outcome::understood;
}

Outcome readMmArea(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 43;
  if (packet.body.size() < kBytes) return Outcome::damaged;
  const RoutingArea area = routingAreaAt(packet.body, 2);
  if (!isArea(area.location)) return Outcome::notOurs;
  picture.nas.mm.area = area.location;
  picture.nas.gmm.area = area;
  told.tell(metric::kMmContext);
  told.tell(metric::kGmmContext);
  return Outcome::understood;
}

Outcome readDynamicIdentity(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 5;
  constexpr std::uint8_t kTmsi = 0;
  constexpr std::uint8_t kPacketTmsi = 1;
  constexpr std::uint32_t kNone = 0xFFFFFFFF;
  const ByteView body = packet.body;
  if (body.size() < kBytes) return Outcome::damaged;
  if (body[0] > kPacketTmsi) return Outcome::notOurs;
  const std::uint32_t identity = u32At(body, 1);
  const auto known = identity == kNone ? std::nullopt : std::optional(identity);
  if (body[0] == kTmsi) {
    picture.nas.mm.tmsi = known;
    told.tell(metric::kMmContext);
  } else {
    picture.nas.gmm.pTmsi = known;
    told.tell(metric::kGmmContext);
  }
  return Outcome::understood;
}

Outcome readEquivalentNetworks(const LogPacket& packet, Picture& picture, Told& told) {
  constexpr std::size_t kHeadBytes = 4;
  constexpr std::size_t kMost = 5;
  const ByteView body = packet.body;
  if (body.size() < kHeadBytes + kMost * kPlmnBytes) return Outcome::damaged;
  const std::size_t count = body[kHeadBytes - 1];
  if (count > kMost) return Outcome::damaged;
  std::vector<PlmnCode> networks;
  for (std::size_t i = 0; i < count; ++i) {
    const PlmnCode network = plmnAt(body, kHeadBytes + i * kPlmnBytes);
    if (!networkOf(network)) return Outcome::damaged;
    networks.push_back(network);
  }
  picture.nas.common.equivalents = networks;
  told.tell(metric::kMmCommonInfo);
  return Outcome::understood;
}

}  // namespace qel::diagnostics
