// Gives the terminal back when the program ends otherwise than it was meant to.
#pragma once

#include <termios.h>

#include <string>

namespace qel::watch {

// One, on the main thread, made before other threads and before whoever else handles signals. A
// fatal error on any thread, and every signal that ends a process and can be caught, gives back a
// terminal that is held; then the program ends as it would have.
class TerminalRescue {
 public:
  TerminalRescue();
  ~TerminalRescue();
  TerminalRescue(const TerminalRescue&) = delete;
  TerminalRescue& operator=(const TerminalRescue&) = delete;
};

// The terminal of the standard streams is changed from here on: how it was set, and what must be
// written to it to leave.
void holdTerminal(const termios& before, std::string leave);
// It was given back.
void releaseTerminal();
// False once it was given back, by whoever did.
bool isTerminalHeld();

}  // namespace qel::watch
