// The main thread of a subcommand that runs until it is told to end.
#pragma once

#include <poll.h>

#include <chrono>
#include <optional>
#include <vector>

#include "tesk/bus/BusConnector.h"
#include "tools/StopSignals.h"

namespace qel::tools {

// One, on the main thread, made before other threads. SIGINT and SIGTERM end the loop.
class MainLoop {
 public:
  using Clock = std::chrono::steady_clock;

  MainLoop();
  ~MainLoop();
  MainLoop(const MainLoop&) = delete;
  MainLoop& operator=(const MainLoop&) = delete;

  // Ends the loop, too, when nobody reads what goes to standard output any more.
  void watchStandardOutput();

  // Wakes up, too, when there is something to read.
  void watchInput(int descriptor) { _waited.push_back({descriptor, POLLIN, 0}); }

  // Waits for work of the main queue, at most until that time, and does one item of it. False when
  // the program is to end.
  bool runOnce(std::optional<Clock::time_point> until);

  // How this thread waits for the service's answers: a few seconds, and no longer than until the
  // program is told to end. For connections that do not outlive the loop.
  tesk::bus::AnswerWaitMaker answerWaits();

 private:
  class AnswerWait;

  bool isStopping() const;

  StopSignals _signals;
  std::vector<pollfd> _waited;  // the bell, standard output, inputs
  bool _outputClosed = false;
  bool _more = true;  // work may have come before this loop
};

}  // namespace qel::tools
