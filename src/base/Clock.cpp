#include "base/Clock.h"

#include <chrono>

namespace qel {
namespace {

class SystemClock final : public Clock {
 public:
  std::uint64_t nowMs() const override {
    using namespace std::chrono;
    return static_cast<std::uint64_t>(
        duration_cast<milliseconds>(system_clock::now().time_since_epoch()).count());
  }
};

}  // namespace

const Clock& systemClock() {
  static const auto& clock = *new SystemClock;  // threads may still ask while the process ends
  return clock;
}

}  // namespace qel
