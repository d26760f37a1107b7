// Another client of the service, or of the bus alone, who wants short answers.
#pragma once

#include <atomic>
#include <memory>
#include <mutex>
#include <string>
#include <thread>

#include "harness/Trial.h"

namespace qel::trials {

// Asks on a thread of its own, a hundred times a second, until the end of this object.
class Caller {
 public:
  // The bus answers by itself: so long a call takes without the service.
  enum class Asked { service, bus };

  explicit Caller(std::string busAddress, Asked asked = Asked::service);
  ~Caller();
  Caller(const Caller&) = delete;
  Caller& operator=(const Caller&) = delete;

  // The longest wait since the last time somebody asked for it, that of the call under way too.
  milliseconds longestWait();
  std::uint64_t answers() const { return _answers; }

 private:
  void run();
  void ask();
  void note(Clock::time_point askedAt);

  const std::string _busAddress;
  const Asked _asked;
  std::atomic<bool> _stopping = false;
  std::atomic<std::uint64_t> _answers = 0;
  std::mutex _mutex;
  Clock::time_point _askedAt;
  bool _asking = false;
  milliseconds _longest{0};
  std::thread _thread;
};

}  // namespace qel::trials
