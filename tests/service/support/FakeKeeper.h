// A keeper that keeps states in memory, and a clock whose pauses last until a test ends them.
#pragma once

#include <chrono>
#include <condition_variable>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

#include "service/StateKeeper.h"
#include "sources/WaitClock.h"

namespace qel::testing {

// Any thread.
class KeptStates {
 public:
  void add(const service::KeptState& state) {
    std::unique_lock lock(_mutex);
    ++_begun;
    _changed.notify_all();
    _changed.wait(lock, [&] { return !_isHeld; });
    _states.push_back(state);
    _changed.notify_all();
  }
  // Like a disk that does not answer: whoever adds a state waits from now on, or goes on.
  void hold(bool isHeld) {
    const std::lock_guard lock(_mutex);
    _isHeld = isHeld;
    _changed.notify_all();
  }
  // Until so many have begun to add a state.
  bool waitForBegun(std::size_t count) const {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, std::chrono::seconds(30), [&] { return _begun >= count; });
  }
  std::vector<service::KeptState> all() const {
    const std::lock_guard lock(_mutex);
    return _states;
  }
  bool waitFor(std::size_t count) const {
    std::unique_lock lock(_mutex);
    return _changed.wait_for(lock, std::chrono::seconds(30),
                             [&] { return _states.size() >= count; });
  }

 private:
  mutable std::mutex _mutex;
  mutable std::condition_variable _changed;
  std::vector<service::KeptState> _states;
  std::size_t _begun = 0;
  bool _isHeld = false;
};

class FakeKeeper final : public service::StateKeeper {
 public:
  explicit FakeKeeper(std::shared_ptr<KeptStates> saved, service::KeptState found = {})
      : _saved(std::move(saved)), _found(std::move(found)) {}

  service::KeptState load() override { return _found; }
  void save(const service::KeptState& state) override { _saved->add(state); }

 private:
  const std::shared_ptr<KeptStates> _saved;
  const service::KeptState _found;
};

class HeldWaitClock final : public sources::WaitClock {
 public:
  std::uint64_t nowMs() const override {
    const std::lock_guard lock(_mutex);
    return _nowMs;
  }
  bool waitUntilMs(std::uint64_t momentMs, const std::stop_token& stop) override {
    std::unique_lock lock(_mutex);
    ++_waits;
    _moved.notify_all();
    return _moved.wait(lock, stop, [&] { return _nowMs >= momentMs; });
  }

  void advance(std::uint64_t byMs) {
    const std::lock_guard lock(_mutex);
    _nowMs += byMs;
    _moved.notify_all();
  }
  // Until somebody has begun to wait so many times in all.
  bool waitForWaits(int count) {
    std::unique_lock lock(_mutex);
    return _moved.wait_for(lock, std::chrono::seconds(30), [&] { return _waits >= count; });
  }

 private:
  mutable std::mutex _mutex;
  std::condition_variable_any _moved;
  std::uint64_t _nowMs = 0;
  int _waits = 0;
};

}  // namespace qel::testing
