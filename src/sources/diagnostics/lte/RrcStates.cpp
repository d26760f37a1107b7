#include "sources/diagnostics/lte/RrcStates.h"

#include <array>
#include <limits>

#include "sources/Metrics.h"

namespace qel::diagnostics {
namespace {

using rrc::lte::Kind;
using Cause = std::optional<std::int32_t>;

// Values of LteRrcState.
constexpr std::int32_t kNull = 0;
constexpr std::int32_t kIdle = 1;
constexpr std::int32_t kConnecting = 2;
constexpr std::int32_t kConnected = LteRrcState::kConnected;
constexpr std::int32_t kEnding = 4;
constexpr std::int32_t kLeaving = 5;
constexpr std::int32_t kComing = 6;

// Values of LteRrcCause: the first of those that stand in the order of 36.331, and others.
constexpr std::int32_t kFirstEstablishment = 0;
constexpr std::int32_t kFirstReestablishment = 6;
constexpr std::int32_t kReestablishmentRejected = 13;
constexpr std::int32_t kFirstRelease = 14;
constexpr std::int32_t kMovedAway = 20;
constexpr std::int32_t kRejected = 23;
constexpr std::int32_t kNoService = 254;

// By the modem's own numbers. The order of its fifth and sixth was not seen in any log.
constexpr std::array kOfEvent = {kNull,      kNull,    kIdle,   kConnecting,
                                 kConnected, kLeaving, kComing, kEnding};

// A cause and the state it belongs to come this close to one another.
constexpr std::uint64_t kTogetherMs = 10'000;

std::uint64_t distance(std::uint64_t a, std::uint64_t b) { return a > b ? a - b : b - a; }

// Up to the last cause that has a value of ours.
template <class Signalled>
Cause causeOf(Signalled signalled, Signalled last, std::int32_t first) {
  if (signalled > last) return std::nullopt;
  return first + static_cast<std::int32_t>(signalled);
}

bool isOfBeginning(std::int32_t cause) { return cause < 9 || cause == kRejected; }
bool isBeginning(std::int32_t state) { return state == kConnecting || state == kConnected; }

void enter(std::int32_t state, Cause cause, std::uint64_t timeMs, LteRrcState& rrc) {
  rrc.previous = rrc.state;
  rrc.previousMs.reset();
  if (rrc.state && timeMs >= rrc.sinceMs &&
      timeMs - rrc.sinceMs <= std::numeric_limits<std::uint32_t>::max()) {
    rrc.previousMs = static_cast<std::uint32_t>(timeMs - rrc.sinceMs);
  }
  rrc.state = state;
  rrc.sinceMs = timeMs;
  rrc.cause = cause;
}

// With the connection goes what belonged to it; a new try of the same leaves what is measured.
void dropRadio(Picture& picture, Told& told) {
  picture.lte.connection.reception = {};
  if (picture.lte.carriers.empty()) return;
  picture.lte.carriers.clear();
  told.tell(metric::kLteCarrierAggregation);
  told.tell(metric::kLteComponentCarriers);
}

void dropConnection(Picture& picture, Told& told) {
  picture.lte.connection.measuring = {};
  dropRadio(picture, told);
}

// A state that the modem did not tell itself.
void conclude(std::int32_t state, Cause cause, std::uint64_t timeMs, Picture& picture, Told& told) {
  LteRrcState& rrc = picture.lte.connection.rrc;
  if (rrc.modemTells || rrc.state == state) return;
  enter(state, cause, timeMs, rrc);
  told.tell(metric::kLteRrcState);
}

// The cause of a state that the modem tells itself, before it or after.
void announce(std::int32_t cause, std::uint64_t timeMs, LteRrcState& rrc) {
  if (!rrc.modemTells) return;
  const bool fits = rrc.state && isBeginning(*rrc.state) == isOfBeginning(cause);
  if (fits && !rrc.cause && distance(rrc.sinceMs, timeMs) <= kTogetherMs) {
    rrc.cause = cause;
  } else {
    rrc.announced = {cause, timeMs};
  }
}

Cause causeForEvent(std::int32_t state, std::uint64_t timeMs, LteRrcState& rrc) {
  if (rrc.announced && distance(rrc.announced->timeMs, timeMs) <= kTogetherMs &&
      (rrc.announced->cause == kNoService ||
       isBeginning(state) == isOfBeginning(rrc.announced->cause))) {
    const Cause cause = rrc.announced->cause;
    rrc.announced.reset();
    return cause;
  }
  // It goes on to the state that the one before it led to.
  const bool goesOn =
      (state == kConnected && rrc.state == kConnecting) || (state == kIdle && rrc.state == kEnding);
  return goesOn ? rrc.cause : std::nullopt;
}

void begin(Cause cause, std::uint64_t timeMs, Picture& picture, Told& told) {
  conclude(kConnecting, cause, timeMs, picture, told);
  if (cause) announce(*cause, timeMs, picture.lte.connection.rrc);
}

void end(Cause cause, std::uint64_t timeMs, Picture& picture, Told& told) {
  conclude(kIdle, cause, timeMs, picture, told);
  if (cause) announce(*cause, timeMs, picture.lte.connection.rrc);
  dropConnection(picture, told);
}

void fail(Cause cause, std::uint64_t timeMs, Picture& picture, Told& told) {
  auto& failure = picture.lte.connection.failure;
  const bool isKnown = failure && distance(failure->timeMs, timeMs) <= kTogetherMs;
  failure = LteLinkFailure{timeMs, !cause && isKnown ? failure->cause : cause};
  told.tell(metric::kLteRadioLinkFailure);
}

void followRelease(const rrc::lte::ConnectionRelease& release, std::uint64_t timeMs,
                   Picture& picture, Told& told) {
  const Cause cause =
      causeOf(release.cause, rrc::lte::ReleaseCause::csFallbackHighPriority, kFirstRelease);
  conclude(kEnding, cause, timeMs, picture, told);
  end(cause, timeMs, picture, told);
}

void followReestablishment(const rrc::lte::ReestablishmentRequest& request, std::uint64_t timeMs,
                           Picture& picture, Told& told) {
  const Cause cause =
      causeOf(request.cause, rrc::lte::ReestablishmentCause::otherFailure, kFirstReestablishment);
  fail(cause, timeMs, picture, told);
  begin(cause, timeMs, picture, told);
  dropRadio(picture, told);
}

// Any message on a dedicated channel: there is a connection.
void followConnected(std::uint64_t timeMs, Picture& picture, Told& told) {
  const LteRrcState& rrc = picture.lte.connection.rrc;
  conclude(kConnected, rrc.state == kConnecting ? rrc.cause : std::nullopt, timeMs, picture, told);
}

}  // namespace

void followState(const rrc::LteMessage& message, rrc::LteChannel channel, std::uint64_t timeMs,
                 Picture& picture, Told& told) {
  switch (message.kind) {
    case Kind::rrcConnectionRequest:
      if (!message.request) return;
      begin(causeOf(message.request->cause, rrc::lte::EstablishmentCause::delayTolerantAccess,
                    kFirstEstablishment),
            timeMs, picture, told);
      return;
    case Kind::rrcConnectionResumeRequest:
    case Kind::rrcConnectionSetup:
      begin(std::nullopt, timeMs, picture, told);
      return;
    case Kind::rrcConnectionReestablishmentRequest:
      if (!message.reestablishmentRequest) return;
      followReestablishment(*message.reestablishmentRequest, timeMs, picture, told);
      return;
    case Kind::rrcConnectionReject:
      end(kRejected, timeMs, picture, told);
      return;
    case Kind::rrcConnectionReestablishmentReject:
      end(kReestablishmentRejected, timeMs, picture, told);
      return;
    case Kind::rrcConnectionRelease:
      if (message.release) followRelease(*message.release, timeMs, picture, told);
      return;
    case Kind::mobilityFromEutraCommand:
      conclude(kLeaving, kMovedAway, timeMs, picture, told);
      return;
    default:
      if (channel == rrc::LteChannel::dlDcch || channel == rrc::LteChannel::ulDcch) {
        followConnected(timeMs, picture, told);
      }
  }
}

Outcome readRrcState(const ModemEvent& event, Picture& picture, Told& told) {
  if (event.payload.size() != 1 || event.payload[0] >= kOfEvent.size()) return Outcome::damaged;
  const std::int32_t state = kOfEvent[event.payload[0]];
  LteRrcState& rrc = picture.lte.connection.rrc;
  rrc.modemTells = true;
  if (rrc.state != state) {
    enter(state, causeForEvent(state, event.timeMs, rrc), event.timeMs, rrc);
    told.tell(metric::kLteRrcState);
  }
  // Events come late: what a message has said since then belongs to another connection.
  const bool isOver = state == kIdle || state == kNull;
  if (isOver && event.timeMs >= picture.lte.connection.configuredMs) dropConnection(picture, told);
  return Outcome::understood;
}

Outcome readOutOfService(const ModemEvent& event, Picture& picture, Told& /*told*/) {
  picture.lte.connection.rrc.announced = {kNoService, event.timeMs};
  return Outcome::understood;
}

Outcome readRadioLinkFailure(const ModemEvent& event, Picture& picture, Told& told) {
  constexpr std::size_t kBytes = 2;  // a counter, and a cause whose values are not known
  if (event.payload.size() != kBytes) return Outcome::damaged;
  fail(std::nullopt, event.timeMs, picture, told);
  return Outcome::understood;
}

}  // namespace qel::diagnostics
