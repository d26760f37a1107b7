// basebandd: the baseband manager service as a program of its own.

#include <poll.h>
#include <sys/signalfd.h>
#include <sysexits.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <iostream>
#include <memory>

#include "base/CoreDumps.h"
#include "base/LogSink.h"
#include "base/SystemLogSink.h"
#include "service/InProcessConnector.h"
#include "service/StateFile.h"
#include "service/bus/BusFront.h"
#include "service/daemon/Options.h"

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

int fail(int code, const std::string& why) {
  std::cerr << "basebandd: " << why << '\n';
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
  std::signal(SIGXFSZ, SIG_IGN);  // a file at its limit shows as a failed write
  using Echo = qel::SystemLogSink::Echo;
  qel::setSystemLog(std::make_shared<qel::SystemLogSink>(
      "basebandd", options->verbose ? Echo::standardError : Echo::none));
  std::unique_ptr<StateKeeper> keeper;
  if (!options->stateDirectory.empty()) {
    keeper = std::make_unique<StateFile>(options->stateDirectory);
  }
  SourceError error;
  const auto core = makeServiceCore(options->source, error, std::move(keeper));
  if (!core) return fail(error.exitCode, error.message);
  return run(core, {options->bus}, stop);
}
