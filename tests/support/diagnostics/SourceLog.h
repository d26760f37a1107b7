// Keeps what a source tells, for a test to wait for.
#pragma once

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "messages/catalogue/KBBMetricUtility.h"
#include "sources/EventSource.h"

namespace qel::diagnostics::test {

// Any thread.
class SourceLog final : public sources::EventReceiver {
 public:
  Taken take(const sources::SourceEvent& event) override {
    const std::lock_guard lock(_mutex);
    if (!_anyoneListens) return Taken::nobodyListens;
    _events.push_back(event);
    _changed.notify_all();
    return Taken::yes;
  }
  void conditionChanged(const sources::SourceCondition& condition) override {
    const std::lock_guard lock(_mutex);
    _states.emplace_back(condition.state);
    _changed.notify_all();
  }

  void listen(bool on) {
    const std::lock_guard lock(_mutex);
    _anyoneListens = on;
  }
  std::vector<sources::SourceEvent> events() const {
    const std::lock_guard lock(_mutex);
    return _events;
  }
  std::vector<std::string> states() const {
    const std::lock_guard lock(_mutex);
    return _states;
  }

  // How many events of that metric there were.
  std::size_t count(std::uint32_t metric) const {
    const std::lock_guard lock(_mutex);
    return countOf(metric);
  }

  // False when it does not come within half a minute.
  bool waitForState(const std::string& state) {
    return waitFor([&] { return !_states.empty() && _states.back() == state; });
  }
  bool waitForMetric(std::uint32_t metric, std::size_t count = 1) {
    return waitFor([&] { return countOf(metric) >= count; });
  }

 private:
  bool waitFor(const std::function<bool()>& there) {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, std::chrono::seconds{30}, there);
  }
  std::size_t countOf(std::uint32_t metric) const {
    std::size_t count = 0;
    for (const sources::SourceEvent& event : _events) {
      const Value* number = event.entries.find("kKeyMetricID");
      if (number != nullptr && number->asInt64() == std::int64_t{metric} + kMetricEventBase)
        ++count;
    }
    return count;
  }

  mutable std::mutex _mutex;
  std::condition_variable _changed;
  bool _anyoneListens = true;
  std::vector<sources::SourceEvent> _events;
  std::vector<std::string> _states;
};

// False when it does not come true within half a minute.
inline bool comesTrue(const std::function<bool()>& there) {
  const auto end = std::chrono::steady_clock::now() + std::chrono::seconds{30};
  while (!there()) {
    if (std::chrono::steady_clock::now() > end) return false;
    std::this_thread::sleep_for(std::chrono::milliseconds{2});
  }
  return true;
}

}  // namespace qel::diagnostics::test
