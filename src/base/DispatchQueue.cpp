#include "base/DispatchQueue.h"

#include <pthread.h>

namespace qel {

SerialQueue::SerialQueue(std::string label)
    : _label(std::move(label)), _thread([this] { run(); }) {
  constexpr std::size_t kLongestThreadName = 15;
  ::pthread_setname_np(_thread.native_handle(), _label.substr(0, kLongestThreadName).c_str());
}

SerialQueue::~SerialQueue() {
  {
    const std::lock_guard lock(_mutex);
    _stopping = true;
  }
  _changed.notify_one();
  _thread.join();
}

void SerialQueue::async(Work work) {
  {
    const std::lock_guard lock(_mutex);
    _waiting.push_back(std::move(work));
  }
  _changed.notify_one();
}

void SerialQueue::run() {
  std::unique_lock lock(_mutex);
  while (true) {
    _changed.wait(lock, [this] { return _stopping || !_waiting.empty(); });
    if (_stopping) return;
    Work work = std::move(_waiting.front());
    _waiting.pop_front();
    lock.unlock();
    work();
    work = nullptr;
    lock.lock();
  }
}

MainQueue& MainQueue::shared() {
  static MainQueue queue;
  return queue;
}

void MainQueue::async(Work work) {
  Work waker;
  {
    const std::lock_guard lock(_mutex);
    _waiting.push_back(std::move(work));
    if (_waiting.size() == 1) waker = _waker;
  }
  _changed.notify_one();
  if (waker) waker();
}

void MainQueue::setWaker(Work waker) {
  const std::lock_guard lock(_mutex);
  _waker = std::move(waker);
}

std::size_t MainQueue::drain() {
  std::deque<Work> ready;
  {
    const std::lock_guard lock(_mutex);
    ready.swap(_waiting);
  }
  for (Work& work : ready) work();
  return ready.size();
}

bool MainQueue::runUntil(const std::function<bool()>& condition,
                         std::chrono::milliseconds timeout) {
  const auto deadline = std::chrono::steady_clock::now() + timeout;
  while (!condition()) {
    std::unique_lock lock(_mutex);
    if (!_changed.wait_until(lock, deadline, [this] { return !_waiting.empty(); })) {
      lock.unlock();
      return condition();
    }
    lock.unlock();
    drain();
  }
  return true;
}

}  // namespace qel
