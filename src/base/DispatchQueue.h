// Queues of work: one with a thread of its own, one that the main thread drains.
#pragma once

#include <chrono>
#include <condition_variable>
#include <deque>
#include <functional>
#include <limits>
#include <memory>
#include <mutex>
#include <string>
#include <thread>

#include "base/SmallBlocks.h"
#include "base/Work.h"

namespace qel {

using WorkList = std::deque<Work, SmallBlockAllocator<Work>>;

// Runs work items one at a time, in the order in which they came. async may be called from any
// thread, also from a running item.
class DispatchQueue {
 public:
  virtual ~DispatchQueue() = default;
  virtual void async(Work work) = 0;
};

// Runs its work on a thread of its own, which carries the label (its first 15 characters) as name.
// The destructor waits for the item that runs and drops the items that wait; when the item that
// runs is what lets go of the queue, it does not wait.
class SerialQueue final : public DispatchQueue {
 public:
  explicit SerialQueue(std::string label);
  ~SerialQueue() override;
  SerialQueue(const SerialQueue&) = delete;
  SerialQueue& operator=(const SerialQueue&) = delete;

  const std::string& label() const { return _label; }
  void async(Work work) override;

 private:
  struct State;
  static void run(const std::shared_ptr<State>& state);

  const std::string _label;
  const std::shared_ptr<State> _state;  // the thread's too: it may outlive the queue
  std::thread _thread;
};

// Work for the main thread. Items run only inside drain and runUntil, which the main thread calls;
// an event loop sets a waker that makes it do so.
class MainQueue final : public DispatchQueue {
 public:
  static MainQueue& shared();

  void async(Work work) override;

  // Called from any thread when the queue stops being empty. Set before other threads use it.
  void setWaker(std::function<void()> waker);

  // Runs the items that wait now, none that they add, `most` at most. True when items are left.
  bool drain(std::size_t most = std::numeric_limits<std::size_t>::max());

  // Drains until the condition holds or the time is over. True when it holds.
  bool runUntil(const std::function<bool()>& condition, std::chrono::milliseconds timeout);

 private:
  std::mutex _mutex;
  std::condition_variable _changed;
  WorkList _waiting;
  std::shared_ptr<const std::function<void()>> _waker;
};

}  // namespace qel
