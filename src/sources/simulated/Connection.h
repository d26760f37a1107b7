// The phone's connection to its cell, in the terms of each technology.
#pragma once

#include <cstdint>

#include "sources/simulated/Changes.h"
#include "sources/simulated/Network.h"
#include "sources/simulated/Traffic.h"
#include "sources/simulated/WireCodes.h"

namespace qel::sources {

struct LteRrcRecord {
  std::int32_t state = kLteRrcIdle;
  std::int32_t previous = kLteRrcNull;
  std::uint64_t previousMs = 0;  // how long the previous state had lasted
  std::int32_t cause = kLteCauseNotApplicable;
  std::uint64_t sinceMs = 0;
};

struct UmtsRrcRecord {
  std::int32_t state = kUmtsRrcInactive;
  std::int32_t establishmentCause = kUmtsOriginatingInteractive;
  std::int32_t releaseCause = kUmtsReleaseNone;
};

// At most one change of state in a step. One thread.
class Connection {
 public:
  Connection(Technology technology, std::uint64_t timeMs);

  // `radioUsable`: the serving cell can be heard and answered.
  void step(const Demand& demand, bool radioUsable, std::uint64_t timeMs, Changes& changes);

  // The serving cell is now one of another technology; a connection goes along.
  void moveTo(Technology technology, std::uint64_t timeMs, Changes& changes);

  bool connected() const { return _phase == Phase::connected; }
  bool idle() const { return _phase == Phase::idle; }
  // Lost its radio link and looks for a cell to go on with.
  bool recovering() const { return _phase == Phase::recovering; }
  std::uint64_t connectedSinceMs() const { return _phaseSinceMs; }
  Purpose purpose() const { return _purpose; }
  bool gsmDedicated() const;
  const LteRrcRecord& lte() const { return _lte; }
  const UmtsRrcRecord& umts() const { return _umts; }

 private:
  enum class Phase : std::uint8_t { idle, connecting, connected, recovering, ending };

  void setUp(const Demand& demand, Changes& changes);
  void established(Changes& changes);
  void stay(const Demand& demand, bool radioUsable, Changes& changes);
  void lose(Changes& changes);
  void recover(bool radioUsable, Changes& changes);
  void release(std::int32_t lteCause, std::int32_t umtsCause, Changes& changes);
  void finish(Changes& changes);
  void enter(Phase phase);
  void setLte(std::int32_t state, std::int32_t cause, Changes& changes);
  void setUmts(std::int32_t state, Changes& changes);
  void setPurpose(Purpose purpose, Changes& changes);

  Technology _technology;
  Phase _phase = Phase::idle;
  Purpose _purpose = Purpose::none;
  std::uint64_t _nowMs;
  std::uint64_t _phaseSinceMs;
  std::uint64_t _activeMs = 0;  // last time that anything was sent
  std::uint64_t _heardMs = 0;   // last time that the radio was usable
  LteRrcRecord _lte;
  UmtsRrcRecord _umts;
};

}  // namespace qel::sources
