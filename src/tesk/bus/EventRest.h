// How a client that is in no hurry spares its device: it lets a few events come together.
#pragma once

#include <chrono>
#include <cstddef>
#include <optional>

namespace tesk::bus {

// One thread's. Every event that is waited for wakes the device, and each thread that it goes
// through; those that are read together do so once. While more come than kMostPerSecond there is no
// rest: then it is work that costs, and nobody is to wait for it.
class EventRest {
 public:
  using Clock = std::chrono::steady_clock;
  static constexpr std::size_t kMostPerSecond = 64;

  // 0: none ever.
  explicit EventRest(std::chrono::milliseconds rest) : _rest(rest) {}

  // So many were read now. Until when none is waited for; nothing: they are.
  std::optional<Clock::time_point> after(std::size_t events, Clock::time_point now);

 private:
  const std::chrono::milliseconds _rest;
  Clock::time_point _since;  // of the second that is counted
  std::size_t _events = 0;
  bool _wasBusy = false;  // in the one before
};

}  // namespace tesk::bus
