#include "tools/MainLoop.h"

#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <cstdint>
#include <limits>

#include "base/DispatchQueue.h"

namespace qel::tools {
namespace {

constexpr std::array kStopSignals = {SIGINT, SIGTERM};

std::atomic<bool> stopped = false;
std::atomic<const tesk::bus::WakeUp*> woken = nullptr;
static_assert(std::atomic<const tesk::bus::WakeUp*>::is_always_lock_free);

extern "C" void stopSignalArrived(int /*signal*/) {
  const int error = errno;
  stopped = true;
  if (const auto* wakeUp = woken.load()) wakeUp->signal();
  errno = error;
}

void handleStopSignals(void (*handler)(int)) {
  struct sigaction action {};
  action.sa_handler = handler;
  action.sa_flags = static_cast<int>(SA_RESETHAND | SA_RESTART);
  sigemptyset(&action.sa_mask);
  for (const int signal : kStopSignals) ::sigaction(signal, &action, nullptr);
}

int waitUntil(std::optional<MainLoop::Clock::time_point> until) {
  if (!until) return -1;
  using std::chrono::milliseconds;
  const auto left = std::chrono::ceil<milliseconds>(*until - MainLoop::Clock::now()).count();
  return static_cast<int>(std::clamp<std::int64_t>(left, 0, std::numeric_limits<int>::max()));
}

}  // namespace

MainLoop::MainLoop() {
  stopped = false;
  woken = &_wakeUp;
  MainQueue::shared().setWaker([this] { _wakeUp.signal(); });
  handleStopSignals(stopSignalArrived);
}

MainLoop::~MainLoop() {
  handleStopSignals(SIG_DFL);
  MainQueue::shared().setWaker({});
  woken = nullptr;
}

bool MainLoop::isStopping() { return stopped || _outputClosed; }

bool MainLoop::runOnce(std::optional<Clock::time_point> until) {
  if (isStopping()) return false;
  // A pipe without a reader answers though nothing is asked of it.
  std::array<pollfd, 2> waited = {
      {{_wakeUp.descriptor(), POLLIN, 0}, {_watchesOutput ? STDOUT_FILENO : -1, 0, 0}}};
  ::poll(waited.data(), waited.size(), _more ? 0 : waitUntil(until));
  _outputClosed = (waited[1].revents & (POLLERR | POLLHUP)) != 0;
  _wakeUp.clear();
  if (isStopping()) return false;
  _more = MainQueue::shared().drain(1);
  return true;
}

}  // namespace qel::tools
