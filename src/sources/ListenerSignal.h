// Tells a source that the set of clients that listen may have changed.
#pragma once

#include <condition_variable>
#include <cstdint>
#include <memory>
#include <mutex>
#include <stop_token>
#include <utility>
#include <vector>

#include "base/WakeUp.h"

namespace qel::sources {

// Any thread. A waiter first reads the generation, then looks whether anyone listens, then waits
// for the generation to go on: so it misses nothing.
class ListenerSignal {
 public:
  std::uint64_t generation() const {
    const std::lock_guard lock(_mutex);
    return _generation;
  }

  void changed() {
    {
      const std::lock_guard lock(_mutex);
      ++_generation;
      std::erase_if(_sleepers, [](const Sleeper& sleeper) { return sleeper.expired(); });
      for (const Sleeper& sleeper : _sleepers) {
        if (const auto there = sleeper.lock()) there->signal();
      }
    }
    _changed.notify_all();
  }

  // Wakes it too at every change, for as long as it is there: for whoever waits in poll.
  using Sleeper = std::weak_ptr<const WakeUp>;
  void wake(Sleeper sleeper) {
    const std::lock_guard lock(_mutex);
    _sleepers.push_back(std::move(sleeper));
  }

  // False when stopped.
  bool waitPast(std::uint64_t generation, const std::stop_token& stop) {
    std::unique_lock lock(_mutex);
    return _changed.wait(lock, stop, [&] { return _generation != generation; });
  }

 private:
  mutable std::mutex _mutex;
  std::condition_variable_any _changed;
  std::uint64_t _generation = 0;
  std::vector<Sleeper> _sleepers;
};

}  // namespace qel::sources
