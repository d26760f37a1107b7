// Another client of the service, who wants short answers.
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
  explicit Caller(std::string busAddress);
  ~Caller();
  Caller(const Caller&) = delete;
  Caller& operator=(const Caller&) = delete;

  // The longest wait since the last time somebody asked for it, that of the call under way too.
  milliseconds longestWait();
  std::uint64_t answers() const { return _answers; }

 private:
  void run();
  void ask();

  const std::string _busAddress;
  std::atomic<bool> _stopping = false;
  std::atomic<std::uint64_t> _answers = 0;
  std::mutex _mutex;
  Clock::time_point _askedAt;
  bool _asking = false;
  milliseconds _longest{0};
  std::thread _thread;
};

}  // namespace qel::trials
