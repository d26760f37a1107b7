#include "service/sources/Pacer.h"

#include <algorithm>

namespace qel::service {
namespace {

// A century: beyond it a moment would no longer fit the clock.
constexpr double kLongestWaitMs = 100.0 * 365 * 24 * 3600 * 1000;

}  // namespace

bool Pacer::wait(std::uint64_t eventTimeMs, const std::stop_token& stop) {
  if (!_anchor || eventTimeMs < _anchor->eventTimeMs) {
    _anchor = Anchor{eventTimeMs, _clock.nowMs()};
    return !stop.stop_requested();
  }
  const double elapsedMs = static_cast<double>(eventTimeMs - _anchor->eventTimeMs) / _speed;
  const auto momentMs =
      _anchor->momentMs + static_cast<std::uint64_t>(std::min(elapsedMs, kLongestWaitMs));
  if (momentMs <= _clock.nowMs()) return !stop.stop_requested();
  return _clock.waitUntilMs(momentMs, stop);
}

}  // namespace qel::service
