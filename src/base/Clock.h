// The time of day, as something that a test can stand in for.
#pragma once

#include <cstdint>

namespace qel {

// Milliseconds since 1970-01-01 00:00 UTC. Any thread.
class Clock {
 public:
  virtual ~Clock() = default;
  virtual std::uint64_t nowMs() const = 0;
};

// The machine's clock.
const Clock& systemClock();

}  // namespace qel
