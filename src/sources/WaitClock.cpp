#include "sources/WaitClock.h"

#include <chrono>
#include <condition_variable>
#include <mutex>

namespace qel::sources {
namespace {

class SteadyWaitClock final : public WaitClock {
 public:
  std::uint64_t nowMs() const override {
    using namespace std::chrono;
    return static_cast<std::uint64_t>(
        duration_cast<milliseconds>(steady_clock::now().time_since_epoch()).count());
  }

  bool waitUntilMs(std::uint64_t momentMs, const std::stop_token& stop) override {
    using namespace std::chrono;
    static thread_local std::mutex mutex;  // kept, since each takes memory
    static thread_local std::condition_variable_any never;
    std::unique_lock lock(mutex);
    never.wait_until(lock, stop,
                     steady_clock::time_point(milliseconds(static_cast<std::int64_t>(momentMs))),
                     [] { return false; });
    return !stop.stop_requested();
  }
};

}  // namespace

WaitClock& steadyWaitClock() {
  static auto& clock = *new SteadyWaitClock;  // sources may still wait while the process ends
  return clock;
}

}  // namespace qel::sources
