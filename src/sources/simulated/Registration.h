// Where the phone is registered: tracking, location and routing areas and temporary identities.
#pragma once

#include <cstdint>
#include <vector>

#include "sources/simulated/Changes.h"
#include "sources/simulated/Network.h"
#include "sources/simulated/Random.h"
#include "sources/simulated/WireCodes.h"

namespace qel::sources {

// Moves between areas and technologies need an update, for which the phone must be connected; each
// update brings new temporary identities. One thread.
class Registration {
 public:
  Registration(std::uint64_t seed, const Cell& cell);

  // The phone wants a connection for an update.
  bool wantsConnection() const { return _inProgress; }

  // A new serving cell.
  void camp(const Cell& cell, Changes& changes);
  // Time passes on it.
  void step(bool connected, std::uint64_t timeMs, Changes& changes);
  // A connection for traffic begins or has ended.
  void serviceRequested(Changes& changes);
  void released(Changes& changes);

  bool inProgress() const { return _inProgress; }
  Technology technology() const { return _technology; }
  const std::vector<std::uint32_t>& trackingAreas() const { return _trackingAreas; }
  std::uint32_t locationArea() const { return _locationArea; }
  std::uint32_t routingArea() const { return _routingArea; }
  std::uint32_t mTmsi() const { return _mTmsi; }
  std::uint32_t tmsi() const { return _tmsi; }
  std::uint32_t pTmsi() const { return _pTmsi; }
  std::int32_t emmProcedure() const { return _emmProcedure; }
  std::int32_t gmmProcedure() const { return _gmmProcedure; }

 private:
  bool mustUpdate(const Cell& cell) const;
  void renew();
  void tell(Changes& changes) const;

  Random _random;
  Technology _technology;
  bool _inProgress = false;
  std::uint64_t _connectedSinceMs = 0;  // 0: not
  std::uint32_t _campedArea;
  std::uint32_t _campedRoutingArea;
  std::vector<std::uint32_t> _trackingAreas;
  std::uint32_t _locationArea;
  std::uint32_t _routingArea;
  std::uint32_t _mTmsi = 0;
  std::uint32_t _tmsi = 0;
  std::uint32_t _pTmsi = 0;
  std::int32_t _emmProcedure = kEmmAttachCombined;
  std::int32_t _gmmProcedure = kGmmNone;
  // Where the last registration was made; coming back from elsewhere needs a new one.
  Technology _registeredBy;
};

}  // namespace qel::sources
