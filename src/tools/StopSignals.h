// SIGINT and SIGTERM, to be noticed between two pieces of work.
#pragma once

#include <cstdint>

#include "base/WakeUp.h"

namespace qel::tools {

// One, on the main thread, made before other threads. While it lives the first SIGINT or SIGTERM is
// only noted; a second one of the same kind does what it did before, which ends the program, should
// a write hold it up.
class StopSignals {
 public:
  // What becomes of a system call that the signal finds waiting: it goes on, or fails with EINTR.
  enum class Waiting : std::uint8_t { goesOn, fails };

  explicit StopSignals(Waiting waiting = Waiting::goesOn);
  ~StopSignals();
  StopSignals(const StopSignals&) = delete;
  StopSignals& operator=(const StopSignals&) = delete;

  // The signal that came, or 0.
  int arrived() const;
  // For poll: rung by the signal, and by whoever has work for the main thread.
  const WakeUp& wakeUp() const { return _wakeUp; }

 private:
  WakeUp _wakeUp;
};

}  // namespace qel::tools
