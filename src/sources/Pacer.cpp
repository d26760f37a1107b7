#include "sources/Pacer.h"

#include <string>

#include "base/LogSink.h"

namespace qel::sources {
namespace {

constexpr unsigned kGapsLogged = 10;

constexpr std::uint64_t count(std::chrono::milliseconds duration) {
  return static_cast<std::uint64_t>(duration.count());
}

}  // namespace

// No gap is long, so the sum fits the clock.
std::uint64_t Pacer::momentOf(std::uint64_t eventTimeMs) const {
  const double elapsedMs = static_cast<double>(eventTimeMs - _anchor->eventTimeMs) / _speed;
  return _anchor->momentMs + static_cast<std::uint64_t>(elapsedMs);
}

void Pacer::shortenGap(std::uint64_t eventTimeMs) {
  const std::uint64_t momentMs = momentOf(_lastTimeMs + count(kShortenedGap));
  if (_gapsLogged < kGapsLogged) {
    ++_gapsLogged;
    systemLog().write("no event from " + std::to_string(_lastTimeMs) + " to " +
                      std::to_string(eventTimeMs) + " (ms since 1970): the gap passes as " +
                      std::to_string(kShortenedGap.count()) + " ms" +
                      (_gapsLogged == kGapsLogged ? "; further gaps are not logged" : ""));
  }
  _anchor = Anchor{eventTimeMs, momentMs};
}

bool Pacer::wait(std::uint64_t eventTimeMs, const std::stop_token& stop) {
  if (!_anchor || eventTimeMs < _lastTimeMs) {
    _anchor = Anchor{eventTimeMs, _clock.nowMs()};
  } else if (eventTimeMs - _lastTimeMs > count(kLongestGap)) {
    shortenGap(eventTimeMs);
  }
  _lastTimeMs = eventTimeMs;
  const std::uint64_t momentMs = momentOf(eventTimeMs);
  if (momentMs <= _clock.nowMs()) return !stop.stop_requested();
  return _clock.waitUntilMs(momentMs, stop);
}

bool Pacer::beginRound(const std::stop_token& stop) {
  resume();
  return _clock.waitUntilMs(_clock.nowMs() + count(kPauseBetweenRounds), stop);
}

}  // namespace qel::sources
