// The viewer in a terminal.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "tools/MainLoop.h"
#include "tools/watch/RecorderKeys.h"
#include "tools/watch/Screens.h"
#include "tools/watch/Terminal.h"
#include "tools/watch/TerminalSignals.h"
#include "tools/watch/View.h"

namespace qel::watch {

// Main thread. Draws when something has changed, five times a second at most, and not at all while
// nothing does.
class Watch {
 public:
  // All of them outlive it.
  Watch(Terminal& terminal, TerminalSignals& signals, tools::MainLoop& loop, Desk& desk,
        History& history);

  // Until it is left, interrupted, or the terminal is gone.
  void run();
  // What feeds it has changed.
  void feedChanged();

 private:
  using Clock = std::chrono::steady_clock;

  void takeSignals();
  void takeKeys();
  void take(const KeyPress& press);
  bool takeEverywhere(const KeyPress& press);
  void moveTo(const KeyPress& press);
  void open(std::unique_ptr<View> view);
  void back();
  void runTimers();
  bool isChanged();
  void drawWhenDue();
  Look lookAt(const Sheet& sheet);
  std::optional<Clock::time_point> nextTurn();

  Terminal& _terminal;
  TerminalSignals& _signals;
  tools::MainLoop& _loop;
  Desk& _desk;
  History& _history;
  Screens _screens;
  RecorderKeys _recorderKeys;
  std::vector<std::unique_ptr<View>> _views;
  Sheet _sheet;  // as last drawn
  std::uint64_t _drawnVersion = 0;
  Clock::time_point _drawnAt;
  std::optional<std::uint64_t> _changesAtMs;
  bool _isTouched = true;
  bool _wasThere = false;  // the service, when it changed last
  bool _isLeft = false;
};

}  // namespace qel::watch
