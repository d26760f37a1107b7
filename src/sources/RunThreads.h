// The threads of a source's runs.
#pragma once

#include <atomic>
#include <functional>
#include <memory>
#include <thread>
#include <vector>

namespace qel::sources {

// One caller at a time. The destructor waits for every thread, but for the one that it runs on: a
// source may be destroyed from within an event of its own.
class RunThreads {
 public:
  RunThreads() = default;
  ~RunThreads();
  RunThreads(const RunThreads&) = delete;
  RunThreads& operator=(const RunThreads&) = delete;

  // Does the work on a new thread, which owns all that it works with, and joins earlier threads
  // that have finished.
  void start(std::function<void()> work);

 private:
  struct Worker {
    std::shared_ptr<std::atomic<bool>> finished;  // the thread is about to end
    std::thread thread;
  };

  std::vector<Worker> _workers;
};

}  // namespace qel::sources
