#include "tools/watch/TerminalSignals.h"

#include <array>
#include <atomic>
#include <cerrno>
#include <csignal>

namespace qel::watch {
namespace {

constexpr std::array kSignals = {SIGWINCH, SIGTSTP, SIGHUP};

std::atomic<bool> resized = false;
std::atomic<bool> toStop = false;
std::atomic<bool> hungUp = false;
std::atomic<const WakeUp*> woken = nullptr;
static_assert(std::atomic<const WakeUp*>::is_always_lock_free);
static_assert(std::atomic<bool>::is_always_lock_free);

extern "C" void terminalSignalArrived(int signal) {
  const int error = errno;
  if (signal == SIGWINCH) resized = true;
  if (signal == SIGTSTP) toStop = true;
  if (signal == SIGHUP) hungUp = true;
  if (const auto* wakeUp = woken.load()) wakeUp->signal();
  errno = error;
}

void handle(void (*handler)(int)) {
  struct sigaction action {};
  action.sa_handler = handler;
  action.sa_flags = SA_RESTART;
  sigemptyset(&action.sa_mask);
  for (const int signal : kSignals) ::sigaction(signal, &action, nullptr);
}

}  // namespace

TerminalSignals::TerminalSignals() {
  woken = &_wakeUp;
  listenAgain();
}

TerminalSignals::~TerminalSignals() {
  handle(SIG_DFL);
  woken = nullptr;
}

void TerminalSignals::listenAgain() { handle(terminalSignalArrived); }
bool TerminalSignals::takeResize() { return resized.exchange(false); }
bool TerminalSignals::takeStop() { return toStop.exchange(false); }
bool TerminalSignals::isHungUp() const { return hungUp; }

}  // namespace qel::watch
