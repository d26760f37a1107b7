// The simulated modem: the events of a phone that is driven along a road.
#pragma once

#include <cstdint>
#include <deque>
#include <optional>
#include <vector>

#include "base/SmallBlocks.h"
#include "sources/EventSequence.h"
#include "sources/simulated/Phone.h"
#include "sources/simulated/RadioScene.h"
#include "sources/simulated/Reports.h"

namespace qel::sources {

// Without end: two towns with LTE, country with UMTS, a valley with GSM alone, and back. The same
// seed and start give the same events, byte for byte; event times are those of the drive. One
// thread; no clock.
class SimulatedDrive final : public EventSequence {
 public:
  SimulatedDrive(std::uint64_t seed, std::uint64_t startMs);

  std::optional<SourceEvent> next() override;
  SourceAnswer query(std::uint32_t metric) override;

  const Phone& phone() const { return _phone; }
  const RadioScene& scene() const { return _scene; }

 private:
  PhoneView view() const { return {_scene, _phone, _samples}; }
  void advance();
  void emit(std::uint32_t metric, std::uint64_t timeMs);
  void emit(Trigger trigger, std::uint64_t timeMs);
  void add(SourceEvent event);
  void emitChanges(const Changes& changes, std::uint64_t stepMs);
  void emitPeriodic(const Changes& changes, std::uint64_t stepMs);
  void collectSample();

  const std::uint64_t _startMs;
  std::uint64_t _step = 0;  // the next one
  RadioScene _scene;
  Phone _phone;
  std::vector<QualitySample> _samples;  // since the last report of them
  // Of the last step, in time order.
  std::deque<SourceEvent, SmallBlockAllocator<SourceEvent>> _ready;
};

}  // namespace qel::sources
