#include "sources/simulated/Connection.h"

#include <array>

#include "sources/Metrics.h"

namespace qel::sources {
namespace {

constexpr std::uint64_t kConnectWithinMs = 1200;
constexpr std::uint64_t kRadioLostMs = 1000;      // T310 (36.331, clause 7.3)
constexpr std::uint64_t kRecoverWithinMs = 5000;  // T311
constexpr std::uint64_t kUmtsSharedAfterMs = 3000;

// How long a connection is kept without anything to send, by technology.
constexpr std::array<std::uint64_t, 3> kInactivityMs = {6000, 7000, 1000};

std::int32_t lteCauseOf(const Demand& demand) {
  if (demand.fromNetwork) return kLteCauseMobileTerminated;
  return demand.purpose == Purpose::signalling ? kLteCauseSignalling : kLteCauseData;
}

std::int32_t umtsCauseOf(const Demand& demand) {
  switch (demand.purpose) {
    case Purpose::call:
      return demand.fromNetwork ? kUmtsTerminatingCall : kUmtsOriginatingCall;
    case Purpose::signalling:
      return kUmtsRegistration;
    default:
      return demand.fromNetwork ? kUmtsTerminatingBackground : kUmtsOriginatingInteractive;
  }
}

}  // namespace

Connection::Connection(Technology technology, std::uint64_t timeMs)
    : _technology(technology), _nowMs(timeMs), _phaseSinceMs(timeMs) {
  _lte.state = technology == Technology::lte ? kLteRrcIdle : kLteRrcNull;
  _lte.sinceMs = timeMs;
  _umts.state = technology == Technology::umts ? kUmtsRrcIdle : kUmtsRrcInactive;
}

void Connection::enter(Phase phase) {
  _phase = phase;
  _phaseSinceMs = _nowMs;
}

void Connection::setLte(std::int32_t state, std::int32_t cause, Changes& changes) {
  if (_lte.state != state) {
    _lte.previous = _lte.state;
    _lte.previousMs = _nowMs - _lte.sinceMs;
    _lte.sinceMs = _nowMs;
  }
  _lte.state = state;
  _lte.cause = cause;
  changes.report(metric::kLteRrcState);
}

void Connection::setUmts(std::int32_t state, Changes& changes) {
  _umts.state = state;
  changes.report(metric::kUmtsRrcState);
}

// What GSM calls dedicated hangs on the purpose.
void Connection::setPurpose(Purpose purpose, Changes& changes) {
  if (_purpose == purpose) return;
  _purpose = purpose;
  if (_technology == Technology::gsm) changes.report(metric::kGsmScellInfo);
}

bool Connection::gsmDedicated() const {
  return _technology == Technology::gsm && _phase == Phase::connected &&
         (_purpose == Purpose::call || _purpose == Purpose::signalling);
}

void Connection::step(const Demand& demand, bool radioUsable, std::uint64_t timeMs,
                      Changes& changes) {
  _nowMs = timeMs;
  if (radioUsable) _heardMs = timeMs;
  switch (_phase) {
    case Phase::idle:
      if (demand.purpose != Purpose::none && radioUsable) setUp(demand, changes);
      break;
    case Phase::connecting:
      if (radioUsable) {
        established(changes);
      } else if (timeMs - _phaseSinceMs > kConnectWithinMs) {
        release(kLteCauseNoResponse, kUmtsReleaseLowerLayer, changes);
      }
      break;
    case Phase::connected:
      stay(demand, radioUsable, changes);
      break;
    case Phase::recovering:
      recover(radioUsable, changes);
      break;
    case Phase::ending:
      finish(changes);
      break;
  }
}

void Connection::setUp(const Demand& demand, Changes& changes) {
  enter(Phase::connecting);
  setPurpose(demand.purpose, changes);
  if (_technology == Technology::lte) setLte(kLteRrcConnecting, lteCauseOf(demand), changes);
  if (_technology == Technology::umts) {
    _umts.establishmentCause = umtsCauseOf(demand);
    _umts.releaseCause = kUmtsReleaseNone;
    setUmts(kUmtsRrcEstablish, changes);
  }
}

void Connection::established(Changes& changes) {
  enter(Phase::connected);
  _activeMs = _nowMs;
  changes.triggers.push_back(Trigger::connectionSetUp);
  if (_technology == Technology::lte) {
    setLte(kLteRrcConnected, _lte.cause, changes);
    changes.report(metric::kLteCdrxConfig);
    changes.report(metric::kLteTxPower);
  }
  if (_technology == Technology::umts) {
    setUmts(kUmtsRrcCellDch, changes);
    changes.report(metric::kUmtsRrcConfig);
  }
  if (_technology == Technology::gsm) changes.report(metric::kGsmScellInfo);
}

void Connection::stay(const Demand& demand, bool radioUsable, Changes& changes) {
  if (!radioUsable && _nowMs - _heardMs >= kRadioLostMs) {
    lose(changes);
    return;
  }
  if (demand.purpose != Purpose::none) {
    _activeMs = _nowMs;
    setPurpose(demand.purpose, changes);
    if (_umts.state == kUmtsRrcCellFach) setUmts(kUmtsRrcCellDch, changes);
    return;
  }
  // Without more to send, what is left of the connection is not a call any more.
  if (_purpose == Purpose::call) setPurpose(Purpose::data, changes);
  const std::uint64_t silentMs = _nowMs - _activeMs;
  if (silentMs >= kInactivityMs[static_cast<std::size_t>(_technology)]) {
    release(kLteCauseReleased, kUmtsReleaseNormal, changes);
  } else if (_umts.state == kUmtsRrcCellDch && silentMs >= kUmtsSharedAfterMs) {
    setUmts(kUmtsRrcCellFach, changes);
  }
}

void Connection::lose(Changes& changes) {
  changes.triggers.push_back(Trigger::radioLinkFailure);
  if (_technology == Technology::lte) {
    changes.report(metric::kLteRadioLinkFailure);
    enter(Phase::recovering);
    setLte(kLteRrcConnecting, kLteCauseReestablishT310Expired, changes);
    return;
  }
  if (_technology == Technology::umts) {
    _umts.releaseCause = kUmtsReleaseLowerLayer;
    setUmts(kUmtsRrcRadioLinkFailure, changes);
  }
  enter(Phase::ending);
}

void Connection::recover(bool radioUsable, Changes& changes) {
  if (radioUsable) {
    enter(Phase::connected);
    _activeMs = _nowMs;
    setLte(kLteRrcConnected, _lte.cause, changes);
    changes.report(metric::kLteCdrxConfig);
  } else if (_nowMs - _phaseSinceMs >= kRecoverWithinMs) {
    enter(Phase::idle);
    setPurpose(Purpose::none, changes);
    setLte(kLteRrcIdle, kLteCauseReestablishT311Expired, changes);
  }
}

void Connection::release(std::int32_t lteCause, std::int32_t umtsCause, Changes& changes) {
  enter(Phase::ending);
  if (_technology == Technology::lte) setLte(kLteRrcEnding, lteCause, changes);
  if (_technology == Technology::umts) {
    _umts.releaseCause = umtsCause;
    setUmts(kUmtsRrcRelease, changes);
  }
}

void Connection::finish(Changes& changes) {
  enter(Phase::idle);
  setPurpose(Purpose::none, changes);
  changes.triggers.push_back(Trigger::connectionReleased);
  if (_technology == Technology::lte) {
    setLte(kLteRrcIdle, _lte.cause, changes);
    changes.report(metric::kLteCdrxConfig);
  }
  if (_technology == Technology::umts) setUmts(kUmtsRrcIdle, changes);
  if (_technology == Technology::gsm) changes.report(metric::kGsmScellInfo);
}

void Connection::moveTo(Technology technology, std::uint64_t timeMs, Changes& changes) {
  _nowMs = timeMs;
  const Technology left = _technology;
  _technology = technology;
  // Only a whole connection is handed over.
  if (!connected()) enter(Phase::idle);
  if (idle()) _purpose = Purpose::none;
  if (left == Technology::lte) {
    setLte(kLteRrcNull, connected() ? kLteCauseMovedFromLte : kLteCauseNotApplicable, changes);
  }
  if (left == Technology::umts) {
    _umts.releaseCause = kUmtsReleaseCellChanged;
    setUmts(kUmtsRrcInactive, changes);
  }
  if (technology == Technology::lte) setLte(kLteRrcIdle, kLteCauseNotApplicable, changes);
  if (technology == Technology::umts) {
    _umts.establishmentCause = umtsCauseOf({connected() ? _purpose : Purpose::signalling, false});
    _umts.releaseCause = kUmtsReleaseNone;
    setUmts(connected() ? kUmtsRrcCellDch : kUmtsRrcIdle, changes);
  }
}

}  // namespace qel::sources
