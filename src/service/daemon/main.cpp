// basebandd: the baseband manager service as a program of its own.

#include <poll.h>
#include <sys/signalfd.h>
#include <sysexits.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <memory>

#include "base/CoreDumps.h"
#include "base/LogSink.h"
#include "base/SystemLogSink.h"
#include "base/TerminalText.h"
#include "service/InProcessConnector.h"
#include "service/StateFile.h"
#include "service/bus/BusFront.h"
#include "service/daemon/Options.h"
#include "service/daemon/StateDirectory.h"

namespace {

using namespace std::chrono_literals;
using namespace qel::service;

// SIGTERM and SIGINT, as a descriptor. Made before any thread, so that all of them block both.
int stopSignals() {
  sigset_t signals;
  sigemptyset(&signals);
  sigaddset(&signals, SIGTERM);
  sigaddset(&signals, SIGINT);
  ::pthread_sigmask(SIG_BLOCK, &signals, nullptr);
  return ::signalfd(-1, &signals, SFD_CLOEXEC | SFD_NONBLOCK);
}

bool isReadable(int descriptor, std::chrono::milliseconds wait) {
  pollfd waited{descriptor, POLLIN, 0};
  return ::poll(&waited, 1, static_cast<int>(wait.count())) > 0;
}

// Until the bus is lost (sdbus::Error) or a stop signal comes.
void serve(BusFront& front, int stop) {
  while (!isReadable(stop, 0ms)) front.waitAndProcess(stop);
}

// A failed write is noticed where it is made: no full disk and no closed pipe ends the service.
void ignoreWriteSignals() {
  std::signal(SIGXFSZ, SIG_IGN);
  std::signal(SIGPIPE, SIG_IGN);
}

// Nothing when the service is to forget, or cannot help it (one log line).
std::unique_ptr<StateKeeper> makeKeeper(const Options& options) {
  if (!options.keepsState) return nullptr;
  if (!options.stateDirectory.empty()) return std::make_unique<StateFile>(options.stateDirectory);
  const std::string directory = defaultStateDirectory();
  const int error = directory.empty() ? 0 : makeStateDirectory(directory);
  if (!directory.empty() && error == 0) return std::make_unique<StateFile>(directory);
  qel::systemLog().write("basebandd: configurations are forgotten at its end: " +
                         (directory.empty() ? "the environment names no directory for them"
                                            : directory + ": " + std::strerror(error)));
  return nullptr;
}

int fail(int code, const std::string& why) {
  qel::complain("basebandd", why);
  return code;
}

// The first connection must succeed; later ones are tried until they do. A failed attempt costs
// some memory inside the bus library, so the pauses grow.
int run(const std::shared_ptr<ServiceCore>& core, const tesk::bus::BusAddress& address, int stop) {
  constexpr auto kFirstPause = 250ms;
  constexpr auto kLongestPause = 5000ms;
  auto pause = 0ms;
  do {
    try {
      const auto connection = tesk::bus::connectTo(address);
      BusFront front(*connection, core);
      qel::systemLog().write("basebandd: on the bus as tesk.BasebandManager1");
      pause = kFirstPause;
      serve(front, stop);
      return EXIT_SUCCESS;
    } catch (const sdbus::Error& error) {
      if (pause == 0ms) return fail(EX_UNAVAILABLE, address.name + " bus: " + error.getMessage());
      if (pause == kFirstPause) qel::systemLog().write("basebandd: bus lost, trying again");
      pause = std::min(pause * 2, kLongestPause);
    }
  } while (!isReadable(stop, pause));
  return EXIT_SUCCESS;
}

}  // namespace

int main(int argc, char** argv) {
  int exitCode = EXIT_SUCCESS;
  const auto options = parseOptions(argc, argv, exitCode);
  if (!options) return exitCode;
  qel::leaveNoCore();
  const int stop = stopSignals();
  ignoreWriteSignals();
  using Echo = qel::SystemLogSink::Echo;
  qel::setSystemLog(std::make_shared<qel::SystemLogSink>(
      "basebandd", options->verbose ? Echo::standardError : Echo::none));
  qel::sources::SourceError error;
  const auto core = makeServiceCore(options->source, error, makeKeeper(*options));
  if (!core) return fail(error.exitCode, error.message);
  return run(core, {options->bus}, stop);
}
