#include "base/TimeAsleep.h"

#include <time.h>

namespace qel {
namespace {

std::chrono::nanoseconds read(clockid_t clock) {
  timespec time{};
  ::clock_gettime(clock, &time);
  return std::chrono::seconds{time.tv_sec} + std::chrono::nanoseconds{time.tv_nsec};
}

}  // namespace

std::chrono::milliseconds timeAsleep() {
  const auto awake = read(CLOCK_MONOTONIC);
  return std::chrono::duration_cast<std::chrono::milliseconds>(read(CLOCK_BOOTTIME) - awake);
}

std::chrono::steady_clock::time_point sleeplessNow() {
  return std::chrono::steady_clock::now() + timeAsleep();
}

}  // namespace qel
