#include "tesk/bus/EventRest.h"

namespace tesk::bus {
namespace {

constexpr std::chrono::seconds kSecond{1};

}  // namespace

std::optional<EventRest::Clock::time_point> EventRest::after(std::size_t events,
                                                             Clock::time_point now) {
  if (_rest.count() == 0) return std::nullopt;
  if (now - _since >= kSecond) {
    _wasBusy = now - _since < 2 * kSecond && _events > kMostPerSecond;
    _since = now;
    _events = 0;
  }
  _events += events;
  if (events == 0 || _wasBusy || _events > kMostPerSecond) return std::nullopt;
  return now + _rest;
}

}  // namespace tesk::bus
