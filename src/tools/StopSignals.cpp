#include "tools/StopSignals.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <cerrno>
#include <csignal>

namespace qel::tools {
namespace {

constexpr std::array kStopSignals = {SIGINT, SIGTERM};

std::atomic<int> noted = 0;
std::atomic<const WakeUp*> woken = nullptr;
static_assert(std::atomic<const WakeUp*>::is_always_lock_free);
std::array<struct sigaction, kStopSignals.size()> actionsBefore;  // read by the handler

void handleAsBefore(int signal) {
  const auto* place = std::ranges::find(kStopSignals, signal);
  ::sigaction(signal, actionsBefore.begin() + (place - kStopSignals.begin()), nullptr);
}

extern "C" void stopSignalArrived(int signal) {
  const int error = errno;
  handleAsBefore(signal);
  noted = signal;
  if (const auto* wakeUp = woken.load()) wakeUp->signal();
  errno = error;
}

}  // namespace

// A signal that was ignored, as of what a shell runs in the background, is to end the program too.
StopSignals::StopSignals(Waiting waiting) {
  noted = 0;
  woken = &_wakeUp;
  struct sigaction action {};
  action.sa_handler = stopSignalArrived;
  action.sa_flags = waiting == Waiting::goesOn ? SA_RESTART : 0;
  sigemptyset(&action.sa_mask);
  for (std::size_t i = 0; i < kStopSignals.size(); ++i) {
    struct sigaction& before = actionsBefore[i];
    ::sigaction(kStopSignals[i], nullptr, &before);
    const bool isIgnored = (before.sa_flags & SA_SIGINFO) == 0 && before.sa_handler == SIG_IGN;
    if (isIgnored) before.sa_handler = SIG_DFL;
    ::sigaction(kStopSignals[i], &action, nullptr);
  }
}

StopSignals::~StopSignals() {
  for (const int signal : kStopSignals) handleAsBefore(signal);
  woken = nullptr;
}

int StopSignals::arrived() const { return noted; }

}  // namespace qel::tools
