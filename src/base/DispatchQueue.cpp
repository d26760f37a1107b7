#include "base/DispatchQueue.h"

#include <pthread.h>

#include <algorithm>
#include <iterator>

namespace qel {

struct SerialQueue::State {
  std::mutex mutex;
  std::condition_variable changed;
  WorkList waiting;
  bool stopping = false;
};

SerialQueue::SerialQueue(std::string label)
    : _label(std::move(label)),
      _state(std::make_shared<State>()),
      _thread([state = _state] { run(state); }) {
  constexpr std::size_t kLongestThreadName = 15;
  ::pthread_setname_np(_thread.native_handle(), _label.substr(0, kLongestThreadName).c_str());
}

SerialQueue::~SerialQueue() {
  {
    const std::lock_guard lock(_state->mutex);
    _state->stopping = true;
  }
  _state->changed.notify_one();
  if (_thread.get_id() == std::this_thread::get_id()) {
    _thread.detach();
  } else {
    _thread.join();
  }
}

void SerialQueue::async(Work work) {
  const auto state = _state;  // the work may let go of this queue before it is told of
  {
    const std::lock_guard lock(state->mutex);
    state->waiting.push_back(std::move(work));
  }
  state->changed.notify_one();
}

void SerialQueue::run(const std::shared_ptr<State>& state) {
  std::unique_lock lock(state->mutex);
  while (true) {
    state->changed.wait(lock, [&state] { return state->stopping || !state->waiting.empty(); });
    if (state->stopping) return;
    Work work = std::move(state->waiting.front());
    state->waiting.pop_front();
    lock.unlock();
    work();
    work = {};
    lock.lock();
  }
}

MainQueue& MainQueue::shared() {
  static auto& queue = *new MainQueue;  // other threads may still post while the process ends
  return queue;
}

void MainQueue::async(Work work) {
  std::shared_ptr<const std::function<void()>> waker;
  {
    const std::lock_guard lock(_mutex);
    _waiting.push_back(std::move(work));
    if (_waiting.size() == 1) waker = _waker;
  }
  _changed.notify_one();
  if (waker) (*waker)();
}

void MainQueue::setWaker(std::function<void()> waker) {
  const std::lock_guard lock(_mutex);
  _waker = waker ? std::make_shared<const std::function<void()>>(std::move(waker)) : nullptr;
}

bool MainQueue::drain(std::size_t most) {
  WorkList ready;
  {
    const std::lock_guard lock(_mutex);
    most = std::min(most, _waiting.size());
    const auto end = _waiting.begin() + static_cast<std::ptrdiff_t>(most);
    ready.assign(std::move_iterator(_waiting.begin()), std::move_iterator(end));
    _waiting.erase(_waiting.begin(), end);
  }
  for (Work& work : ready) work();
  const std::lock_guard lock(_mutex);
  return !_waiting.empty();
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
