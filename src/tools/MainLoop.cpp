#include "tools/MainLoop.h"

#include <poll.h>
#include <unistd.h>

#include <atomic>
#include <memory>

#include "base/DispatchQueue.h"
#include "base/PollTimeout.h"

namespace qel::tools {

class MainLoop::AnswerWait final : public tesk::bus::AnswerWait {
 public:
  explicit AnswerWait(MainLoop& loop) : _loop(loop) {}

  void wait() override {
    const bool isEnding = _loop.isStopping();  // this command belongs to a proper end
    const auto end = Clock::now() + (isEnding ? kPatienceAtTheEnd : kPatience);
    while (!_woken && isEnding == _loop.isStopping() && Clock::now() < end) {
      pollfd waited{_loop._signals.wakeUp().descriptor(), POLLIN, 0};
      ::poll(&waited, 1, pollTimeout(end));
      _loop._signals.wakeUp().clear();
    }
    _loop._more = true;  // what rang may have been work
  }

  void wake() override {
    _woken = true;
    _loop._signals.wakeUp().signal();
  }

 private:
  static constexpr std::chrono::seconds kPatience{5};
  static constexpr std::chrono::seconds kPatienceAtTheEnd{1};

  MainLoop& _loop;
  std::atomic<bool> _woken = false;
};

MainLoop::MainLoop() : _waited{{_signals.wakeUp().descriptor(), POLLIN, 0}, {-1, 0, 0}} {
  MainQueue::shared().setWaker([this] { _signals.wakeUp().signal(); });
}

MainLoop::~MainLoop() { MainQueue::shared().setWaker({}); }

tesk::bus::AnswerWaitMaker MainLoop::answerWaits() {
  return [this] { return std::make_shared<AnswerWait>(*this); };
}

// A pipe without a reader answers though nothing is asked of it.
void MainLoop::watchStandardOutput() { _waited[1].fd = STDOUT_FILENO; }

bool MainLoop::isStopping() const { return _signals.arrived() != 0 || _outputClosed; }

bool MainLoop::runOnce(std::optional<Clock::time_point> until) {
  if (isStopping()) return false;
  for (pollfd& each : _waited) each.revents = 0;
  ::poll(_waited.data(), _waited.size(), _more ? 0 : pollTimeout(until));
  _outputClosed = (_waited[1].revents & (POLLERR | POLLHUP)) != 0;
  if (_waited[0].revents != 0) _signals.wakeUp().clear();
  if (isStopping()) return false;
  _more = MainQueue::shared().drain(1);
  return true;
}

}  // namespace qel::tools
