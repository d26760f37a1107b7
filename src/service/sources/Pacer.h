// Lets the events of a source through at the right moments.
#pragma once

#include <cstdint>
#include <optional>
#include <stop_token>

#include "service/sources/WaitClock.h"

namespace qel::service {

// Event times become moments of the clock: `speed` event seconds pass in one. One thread.
class Pacer {
 public:
  Pacer(WaitClock& clock, double speed) : _clock(clock), _speed(speed) {}

  // Waits for the moment of that time. The first event, one after resume(), and one that goes back
  // in time are due at once, and the following are counted from it. False when stopped.
  bool wait(std::uint64_t eventTimeMs, const std::stop_token& stop);

  // Time has stood still: the next event is due at once.
  void resume() { _anchor.reset(); }

 private:
  struct Anchor {
    std::uint64_t eventTimeMs;
    std::uint64_t momentMs;
  };

  WaitClock& _clock;
  double _speed;
  std::optional<Anchor> _anchor;
};

}  // namespace qel::service
