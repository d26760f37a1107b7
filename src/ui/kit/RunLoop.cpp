#include "ui/kit/RunLoop.h"

#include <algorithm>

namespace qel {

RunLoop& RunLoop::main() {
  static auto& loop = *new RunLoop;  // its timers hold screens that must outlive other statics
  return loop;
}

RunLoop::WakeUp& RunLoop::wakeUpFor(std::chrono::milliseconds interval, TimePoint now) {
  const auto same = [interval](const WakeUp& wakeUp) { return wakeUp.interval == interval; };
  const auto found = std::find_if(_wakeUps.begin(), _wakeUps.end(), same);
  if (found != _wakeUps.end()) return *found;
  return _wakeUps.emplace_back(WakeUp{interval, now + interval, {}});
}

void RunLoop::addTimer(const std::shared_ptr<RepeatingTimer>& timer, TimePoint now) {
  auto& timers = wakeUpFor(timer->interval(), now).timers;
  if (std::find(timers.begin(), timers.end(), timer) != timers.end()) return;
  timers.push_back(timer);
  if (_observer) _observer();
}

std::optional<RunLoop::TimePoint> RunLoop::nextDue() const {
  const auto sooner = [](const WakeUp& a, const WakeUp& b) { return a.due < b.due; };
  const auto next = std::min_element(_wakeUps.begin(), _wakeUps.end(), sooner);
  if (next == _wakeUps.end()) return std::nullopt;
  return next->due;
}

void RunLoop::fireDue(TimePoint now) {
  std::vector<std::shared_ptr<RepeatingTimer>> due;
  for (WakeUp& wakeUp : _wakeUps) {
    if (wakeUp.due > now) continue;
    wakeUp.due += wakeUp.interval;
    if (wakeUp.due <= now) wakeUp.due = now + wakeUp.interval;
    due.insert(due.end(), wakeUp.timers.begin(), wakeUp.timers.end());
  }
  for (const auto& timer : due) timer->fire();
  const auto isOver = [](const auto& timer) { return !timer->isValid(); };
  for (WakeUp& wakeUp : _wakeUps) std::erase_if(wakeUp.timers, isOver);
  std::erase_if(_wakeUps, [](const WakeUp& wakeUp) { return wakeUp.timers.empty(); });
}

}  // namespace qel
