// Writes the service's state in a thread of its own.
#pragma once

#include <condition_variable>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <stop_token>
#include <thread>

#include "service/StateKeeper.h"
#include "sources/WaitClock.h"

namespace qel::service {

// Changes are written at once after a quiet second, or within a second when they can wait; those
// that follow are written together, a second later; what is left is written at the end. So a loss
// of power costs a second at most, and a disk that is slow or full costs the clients nothing.
class StateSaver {
 public:
  static constexpr std::uint64_t kPauseMs = 1000;
  enum class When { now, withinASecond };

  // `state` gives what is to be written, on the saver's thread. It and `clock` outlive the saver.
  StateSaver(std::unique_ptr<StateKeeper> keeper, std::function<KeptState()> state,
             sources::WaitClock& clock);
  ~StateSaver();
  StateSaver(const StateSaver&) = delete;
  StateSaver& operator=(const StateSaver&) = delete;

  // To be called after a change, by any thread that holds no lock which `state` needs. When the
  // change is written at once, this waits for it, a few milliseconds at most: an answered command
  // then nearly always outlives even a service that is killed. While an earlier one is being
  // written, nobody waits: a disk that is slow delays one caller, not all that follow.
  void changed(When when = When::now);

 private:
  void run(const std::stop_token& stop);
  // False at the end, when there is nothing left.
  bool waitForChange(const std::stop_token& stop);

  const std::unique_ptr<StateKeeper> _keeper;
  const std::function<KeptState()> _state;
  sources::WaitClock& _clock;

  std::mutex _mutex;
  std::condition_variable_any _moved;
  std::uint64_t _changes = 0;
  std::uint64_t _written = 0;  // so many of the changes
  bool _isUrgent = false;
  bool _writing = false;
  bool _pausing = false;
  std::stop_source _dozing;  // stopped by a change that cannot wait

  std::jthread _thread;
};

}  // namespace qel::service
