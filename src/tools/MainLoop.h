// The main thread of a subcommand that runs until it is told to end.
#pragma once

#include <chrono>
#include <optional>

#include "tesk/bus/WakeUp.h"

namespace qel::tools {

// One, on the main thread, made before other threads. While it lives the first SIGINT or SIGTERM
// ends the loop; a second one of the same kind ends the program, should a write hold it up.
class MainLoop {
 public:
  using Clock = std::chrono::steady_clock;

  MainLoop();
  ~MainLoop();
  MainLoop(const MainLoop&) = delete;
  MainLoop& operator=(const MainLoop&) = delete;

  // Ends the loop, too, when nobody reads what goes to standard output any more.
  void watchStandardOutput() { _watchesOutput = true; }

  // Waits for work of the main queue, at most until that time, and does one item of it. False when
  // the program is to end.
  bool runOnce(std::optional<Clock::time_point> until);

 private:
  bool isStopping();

  tesk::bus::WakeUp _wakeUp;
  bool _watchesOutput = false;
  bool _outputClosed = false;
  bool _more = true;  // work may have come before this loop
};

}  // namespace qel::tools
