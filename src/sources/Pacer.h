// Lets the events of a source through at the right moments.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <stop_token>

#include "sources/WaitClock.h"

namespace qel::sources {

// Event times become moments of the clock: `speed` event seconds pass in one. One thread.
class Pacer {
 public:
  // Between two events; a longer gap passes as kShortenedGap, and the first few of a run are
  // logged.
  static constexpr std::chrono::milliseconds kLongestGap{60'000};
  static constexpr std::chrono::milliseconds kShortenedGap{1'000};
  // Of the clock, before events begin anew, at any speed.
  static constexpr std::chrono::milliseconds kPauseBetweenRounds{1'000};

  Pacer(WaitClock& clock, double speed) : _clock(clock), _speed(speed) {}

  // Waits for the moment of that time. The first event, one after resume(), and one earlier than
  // the event before are due at once, and the following are counted from it. False when stopped.
  bool wait(std::uint64_t eventTimeMs, const std::stop_token& stop);

  // Time has stood still: the next event is due at once.
  void resume() { _anchor.reset(); }
  // The events begin anew: the next one is due after a pause. False when stopped.
  bool beginRound(const std::stop_token& stop);

 private:
  struct Anchor {
    std::uint64_t eventTimeMs;
    std::uint64_t momentMs;
  };

  std::uint64_t momentOf(std::uint64_t eventTimeMs) const;
  void shortenGap(std::uint64_t eventTimeMs);

  WaitClock& _clock;
  double _speed;
  std::optional<Anchor> _anchor;
  std::uint64_t _lastTimeMs = 0;  // of the event before; none before the anchor is set
  unsigned _gapsLogged = 0;
};

}  // namespace qel::sources
