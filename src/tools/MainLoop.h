// The main thread of a subcommand that runs until it is told to end.
#pragma once

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
  void watchStandardOutput() { _watchesOutput = true; }

  // Wakes up, too, when there is something to read.
  void watchInput(int descriptor) { _inputs.push_back(descriptor); }

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
  std::vector<int> _inputs;
  bool _watchesOutput = false;
  bool _outputClosed = false;
  bool _more = true;  // work may have come before this loop
};

}  // namespace qel::tools
