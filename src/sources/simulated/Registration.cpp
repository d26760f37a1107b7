#include "sources/simulated/Registration.h"

#include <algorithm>

#include "sources/Metrics.h"

namespace qel::sources {
namespace {

constexpr std::uint64_t kUpdateTakesMs = 1400;

}  // namespace

Registration::Registration(std::uint64_t seed, const Cell& cell)
    : _random(scramble(seed, 3)),
      _technology(layerOf(cell).technology),
      _campedArea(cell.area),
      _campedRoutingArea(cell.routingArea),
      _locationArea(cell.area),
      _routingArea(cell.routingArea),
      _registeredBy(_technology) {
  renew();
}

// 23.003, clause 2.4: the two top bits of a P-TMSI are 1, those of a TMSI are not both.
void Registration::renew() {
  _mTmsi = static_cast<std::uint32_t>(_random.next()) | 0xC0000000;
  _tmsi = static_cast<std::uint32_t>(_random.next()) & 0x3FFFFFFF;
  if (_technology == Technology::lte) {
    _trackingAreas = {_campedArea};
  } else {
    _pTmsi = static_cast<std::uint32_t>(_random.next()) | 0xC0000000;
    _routingArea = _campedRoutingArea;
  }
  // A place has the same number as tracking and as location area.
  _locationArea = _campedArea;
  if (_pTmsi == 0) _pTmsi = static_cast<std::uint32_t>(_random.next()) | 0xC0000000;
  _registeredBy = _technology;
}

bool Registration::mustUpdate(const Cell& cell) const {
  const bool fromLte = _registeredBy == Technology::lte;
  if ((_technology == Technology::lte) != fromLte) return true;
  if (fromLte) return std::ranges::find(_trackingAreas, cell.area) == _trackingAreas.end();
  return _locationArea != cell.area || _routingArea != cell.routingArea ||
         _registeredBy != _technology;
}

void Registration::tell(Changes& changes) const {
  if (_technology == Technology::lte) changes.report(metric::kEmmContext);
  changes.report(metric::kMmContext);
  changes.report(metric::kGmmContext);
}

void Registration::camp(const Cell& cell, Changes& changes) {
  _technology = layerOf(cell).technology;
  _campedArea = cell.area;
  _campedRoutingArea = cell.routingArea;
  const bool was = _inProgress;
  _inProgress = mustUpdate(cell);
  _connectedSinceMs = 0;
  if (!_inProgress && !was) return;
  if (_technology == Technology::lte) {
    _emmProcedure = _inProgress ? kEmmTauCombined : kEmmNoProcedure;
  } else {
    _gmmProcedure = _inProgress ? kGmmCombinedRau : kGmmNone;
  }
  tell(changes);
}

void Registration::step(bool connected, std::uint64_t timeMs, Changes& changes) {
  if (!_inProgress || !connected) {
    _connectedSinceMs = 0;
    return;
  }
  if (_connectedSinceMs == 0) _connectedSinceMs = timeMs;
  if (timeMs - _connectedSinceMs < kUpdateTakesMs) return;
  _inProgress = false;
  renew();
  changes.triggers.push_back(Trigger::registered);
  tell(changes);
  changes.report(metric::kMmCommonInfo);
}

void Registration::serviceRequested(Changes& changes) {
  if (_inProgress) return;
  if (_technology == Technology::lte) {
    _emmProcedure = kEmmServiceRequest;
    changes.report(metric::kEmmContext);
  } else {
    _gmmProcedure = kGmmServiceRequest;
    changes.report(metric::kGmmContext);
  }
}

void Registration::released(Changes& changes) {
  if (_inProgress) return;
  if (_technology == Technology::lte) {
    _emmProcedure = kEmmNoProcedure;
    changes.report(metric::kEmmContext);
  } else {
    _gmmProcedure = kGmmNone;
    changes.report(metric::kGmmContext);
  }
}

}  // namespace qel::sources
