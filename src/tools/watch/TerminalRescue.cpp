#include "tools/watch/TerminalRescue.h"

#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cerrno>
#include <csignal>
#include <utility>

#include "base/FatalError.h"

namespace qel::watch {
namespace {

// Those whose usual action ends the process, but for SIGKILL and those that others handle.
constexpr std::array kDeadly = {SIGINT,  SIGQUIT, SIGILL,  SIGTRAP, SIGABRT,   SIGBUS,
                                SIGFPE,  SIGUSR1, SIGSEGV, SIGUSR2, SIGALRM,   SIGTERM,
                                SIGXCPU, SIGPROF, SIGPOLL, SIGSYS,  SIGVTALRM, SIGPWR};
constexpr int kPatienceMs = 200;  // with a terminal that does not read

std::array<struct sigaction, kDeadly.size()> actionsBefore;  // read by the handler
termios settingsBefore;
std::string howToLeave;
std::atomic<bool> isHeld = false;
static_assert(std::atomic<bool>::is_always_lock_free);

// Nothing but what a handler of signals may call.
void giveBack() {
  if (!isHeld.exchange(false)) return;
  pollfd output{STDOUT_FILENO, POLLOUT, 0};
  if (::poll(&output, 1, kPatienceMs) == 1) {
    (void)!::write(STDOUT_FILENO, howToLeave.data(), howToLeave.size());
  }
  ::tcsetattr(STDIN_FILENO, TCSANOW, &settingsBefore);
}

// One that a process sent comes again when this returns; one of a fault does so by itself.
extern "C" void deadlySignalArrived(int signal, siginfo_t* info, void* /*context*/) {
  const int error = errno;
  giveBack();
  const auto* place = std::ranges::find(kDeadly, signal);
  ::sigaction(signal, actionsBefore.begin() + (place - kDeadly.begin()), nullptr);
  if (info->si_code <= 0) ::raise(signal);
  errno = error;
}

}  // namespace

TerminalRescue::TerminalRescue() {
  static const bool isRegistered = [] {
    atFatalError(giveBack);
    return true;
  }();
  (void)isRegistered;
  struct sigaction action {};
  action.sa_sigaction = deadlySignalArrived;
  action.sa_flags = SA_SIGINFO;
  sigemptyset(&action.sa_mask);
  for (std::size_t i = 0; i < kDeadly.size(); ++i) {
    ::sigaction(kDeadly[i], &action, &actionsBefore[i]);
  }
}

TerminalRescue::~TerminalRescue() {
  for (std::size_t i = 0; i < kDeadly.size(); ++i) {
    ::sigaction(kDeadly[i], &actionsBefore[i], nullptr);
  }
}

void holdTerminal(const termios& before, std::string leave) {
  isHeld = false;
  settingsBefore = before;
  howToLeave = std::move(leave);
  isHeld = true;
}

void releaseTerminal() { isHeld = false; }
bool isTerminalHeld() { return isHeld; }

}  // namespace qel::watch
