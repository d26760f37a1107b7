#include "ui/kit/RepeatingTimer.h"

#include "ui/kit/RunLoop.h"

namespace qel {

void RepeatingTimer::schedule(const std::shared_ptr<RepeatingTimer>& timer) {
  RunLoop::main().addTimer(timer, std::chrono::steady_clock::now());
}

void RepeatingTimer::fire() const {
  const auto work = _work;  // the work may invalidate this timer
  if (work) work();
}

}  // namespace qel
