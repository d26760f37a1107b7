// A timer that calls one operation of its target again and again.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <utility>

namespace qel {

class RunLoop;

// Main thread only. Holds its target until it is invalidated; a run loop holds the timer. So a
// target whose timer nobody invalidates lives on.
class RepeatingTimer {
 public:
  template <typename Target>
  RepeatingTimer(std::chrono::milliseconds interval, std::shared_ptr<Target> target,
                 void (Target::*selector)())
      : _interval(interval),
        _work([held = std::move(target), selector] { ((*held).*selector)(); }) {}

  // Makes the timer and adds it to the main run loop.
  template <typename Target>
  static std::shared_ptr<RepeatingTimer> scheduledTimer(std::chrono::milliseconds interval,
                                                        std::shared_ptr<Target> target,
                                                        void (Target::*selector)()) {
    auto timer = std::make_shared<RepeatingTimer>(interval, std::move(target), selector);
    schedule(timer);
    return timer;
  }

  std::chrono::milliseconds interval() const { return _interval; }
  bool isValid() const { return static_cast<bool>(_work); }
  void fire() const;
  // Lets go of the target. The run loop forgets the timer when it is next due.
  void invalidate() { _work = nullptr; }

 private:
  static void schedule(const std::shared_ptr<RepeatingTimer>& timer);

  std::chrono::milliseconds _interval;
  std::function<void()> _work;
};

}  // namespace qel
