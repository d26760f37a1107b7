// A clock on which waiting takes no time.
#pragma once

#include <atomic>
#include <cstdint>
#include <mutex>
#include <vector>

#include "sources/WaitClock.h"

namespace qel::testing {

// Any thread.
class FakeWaitClock final : public sources::WaitClock {
 public:
  std::uint64_t nowMs() const override { return _nowMs; }
  bool waitUntilMs(std::uint64_t momentMs, const std::stop_token& stop) override {
    const std::lock_guard lock(_mutex);
    _waits.push_back(momentMs);
    if (momentMs > _nowMs) _nowMs = momentMs;
    return !stop.stop_requested();
  }

  void setMs(std::uint64_t nowMs) { _nowMs = nowMs; }
  std::vector<std::uint64_t> waits() const {
    const std::lock_guard lock(_mutex);
    return _waits;
  }

 private:
  mutable std::mutex _mutex;
  std::atomic<std::uint64_t> _nowMs = 0;
  std::vector<std::uint64_t> _waits;
};

}  // namespace qel::testing
