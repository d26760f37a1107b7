// A clock that one can wait on, as something that a test can stand in for.
#pragma once

#include <cstdint>
#include <stop_token>

namespace qel::sources {

// Monotonic milliseconds from an arbitrary moment. Any thread.
class WaitClock {
 public:
  virtual ~WaitClock() = default;
  virtual std::uint64_t nowMs() const = 0;
  // Returns at the moment, or false as soon as stopped.
  virtual bool waitUntilMs(std::uint64_t momentMs, const std::stop_token& stop) = 0;
};

// The machine's.
WaitClock& steadyWaitClock();

}  // namespace qel::sources
