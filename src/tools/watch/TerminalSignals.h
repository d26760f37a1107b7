// What the terminal tells by signals: another size, a wish to stop for a while, that it is gone.
#pragma once

#include "base/WakeUp.h"

namespace qel::watch {

// One, on the main thread, made before other threads. While it lives the signals are only noted.
class TerminalSignals {
 public:
  TerminalSignals();
  ~TerminalSignals();
  TerminalSignals(const TerminalSignals&) = delete;
  TerminalSignals& operator=(const TerminalSignals&) = delete;

  // For poll: rung by each of them.
  int descriptor() const { return _wakeUp.descriptor(); }
  void clear() const { _wakeUp.clear(); }

  // Whether it came since this was asked last.
  bool takeResize();
  bool takeStop();
  bool isHungUp() const;
  // After the process went on: stopping had the signal's usual action.
  void listenAgain();

 private:
  WakeUp _wakeUp;
};

}  // namespace qel::watch
