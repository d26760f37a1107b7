#include "app/SignalQuit.h"

#include <fcntl.h>
#include <unistd.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QSocketNotifier>
#include <array>
#include <csignal>

namespace qel {
namespace {

constexpr std::array kSignals = {SIGINT, SIGTERM};
std::array<int, 2> pipeEnds = {-1, -1};

extern "C" void signalArrived(int /*signal*/) {
  const char byte = 0;
  const ssize_t written = ::write(pipeEnds[1], &byte, 1);
  static_cast<void>(written);
}

}  // namespace

SignalQuit::SignalQuit() {
  if (::pipe2(pipeEnds.data(), O_CLOEXEC | O_NONBLOCK) != 0) return;
  auto* notifier = new QSocketNotifier(pipeEnds[0], QSocketNotifier::Read, this);
  connect(notifier, &QSocketNotifier::activated, this, [notifier] {
    notifier->setEnabled(false);
    QCoreApplication::quit();
  });
  for (const int signal : kSignals) std::signal(signal, signalArrived);
}

SignalQuit::~SignalQuit() {
  for (const int signal : kSignals) std::signal(signal, SIG_DFL);
  for (int& end : pipeEnds) {
    if (end >= 0) ::close(end);
    end = -1;
  }
}

}  // namespace qel
