#include "tools/StopSignals.h"

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

extern "C" void stopSignalArrived(int signal) {
  const int error = errno;
  noted = signal;
  if (const auto* wakeUp = woken.load()) wakeUp->signal();
  errno = error;
}

void handleStopSignals(void (*handler)(int), unsigned flags) {
  struct sigaction action {};
  action.sa_handler = handler;
  action.sa_flags = static_cast<int>(SA_RESETHAND | flags);
  sigemptyset(&action.sa_mask);
  for (const int signal : kStopSignals) ::sigaction(signal, &action, nullptr);
}

}  // namespace

StopSignals::StopSignals(Waiting waiting) {
  noted = 0;
  woken = &_wakeUp;
  handleStopSignals(stopSignalArrived, waiting == Waiting::goesOn ? SA_RESTART : 0);
}

StopSignals::~StopSignals() {
  handleStopSignals(SIG_DFL, 0);
  woken = nullptr;
}

int StopSignals::arrived() const { return noted; }

}  // namespace qel::tools
