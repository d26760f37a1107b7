// Recording from any page of the terminal: R begins and ends, m marks a moment.
#pragma once

#include <chrono>
#include <optional>
#include <vector>

#include "tools/watch/Sheet.h"
#include "tools/watch/Terminal.h"
#include "ui/pages/RecordingControl.h"

namespace qel::watch {

// Main thread.
class RecorderKeys {
 public:
  using Clock = std::chrono::steady_clock;

  // It outlives this; none: nothing can be recorded.
  explicit RecorderKeys(RecordingControl* control) : _control(control) {}

  // True when the key meant that.
  bool take(const KeyPress& press);
  // How it goes, for the foot of every page; what came of a key for as long as no other is pressed.
  std::vector<Row> foot(Size size) const;

  void runTimer(Clock::time_point now);
  // When that is to be called next; none: there is nothing to do.
  std::optional<Clock::time_point> nextTurn() const { return _tickAt; }

 private:
  RecordingControl* const _control;
  std::optional<Clock::time_point> _tickAt;
  bool _isNews = false;
};

}  // namespace qel::watch
