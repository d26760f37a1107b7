// Repeating timers of the main thread, and when it must next wake up for them.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "ui/kit/RepeatingTimer.h"

namespace qel {

// Main thread only. Knows no clock: whoever runs it asks when the next timer is due and fires it
// then. Timers of one interval share their wake-ups, so a thousand of them wake the device as often
// as one does; a timer that joins others may therefore fire early the first time.
class RunLoop {
 public:
  using TimePoint = std::chrono::steady_clock::time_point;
  using Observer = std::function<void()>;

  // The one of the process. Its timers wait until somebody runs it.
  static RunLoop& main();

  // Holds the timer until it is invalidated. Adding it again changes nothing.
  void addTimer(const std::shared_ptr<RepeatingTimer>& timer, TimePoint now);

  std::optional<TimePoint> nextDue() const;
  // Fires every timer due by then, once each. Wake-ups that were missed are not made up for.
  void fireDue(TimePoint now);

  // Called when nextDue may have changed other than by fireDue.
  void setObserver(Observer observer) { _observer = std::move(observer); }

 private:
  struct WakeUp {
    std::chrono::milliseconds interval;
    TimePoint due;
    std::vector<std::shared_ptr<RepeatingTimer>> timers;
  };

  WakeUp& wakeUpFor(std::chrono::milliseconds interval, TimePoint now);

  std::vector<WakeUp> _wakeUps;
  Observer _observer;
};

}  // namespace qel
