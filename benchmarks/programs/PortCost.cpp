// What it costs to listen to a modem's diagnostics port: port-cost RAW-LOG…
// Another process is the modem. It sends the frames of the raw logs, 30 a second and over and over,
// and then nothing at all.

#include <poll.h>
#include <signal.h>
#include <unistd.h>

#include <atomic>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "programs/Figures.h"
#include "sources/diagnostics/DiagnosticsSource.h"
#include "sources/diagnostics/port/FrameReader.h"
#include "support/diagnostics/PseudoModem.h"

namespace qel::benchmarks {
namespace {

using namespace std::chrono_literals;
using diagnostics::test::PseudoModem;

constexpr auto kPause = std::chrono::nanoseconds{1s} / 30;
constexpr auto kWarmUp = 3s;
constexpr auto kMeasured = 20s;

std::vector<Bytes> packetsOf(const std::vector<std::string>& files) {
  std::vector<Bytes> packets;
  for (const std::string& name : files) {
    std::ifstream file(name, std::ios::binary);
    const Bytes bytes{std::istreambuf_iterator<char>(file), {}};
    diagnostics::FrameReader reader;
    reader.add(bytes, [&](ByteView packet) {
      constexpr std::uint8_t kLog = 0x10;
      if (packet[0] == kLog) packets.emplace_back(packet.begin(), packet.end());
    });
  }
  return packets;
}

// Sends until it hears anything, then is quiet until the end.
[[noreturn]] void beModem(const std::vector<Bytes>& packets, int name, int orders) {
  PseudoModem modem;
  [[maybe_unused]] const auto told = ::write(name, modem.path().data(), modem.path().size());
  pollfd order{orders, POLLIN, 0};
  for (std::size_t i = 0; ::poll(&order, 1, 0) == 0; i = (i + 1) % packets.size()) {
    modem.send(packets[i]);
    std::this_thread::sleep_for(kPause);
  }
  while (true) ::pause();
}

class Counter final : public sources::EventReceiver {
 public:
  Taken take(const sources::SourceEvent&) override {
    ++events;
    return Taken::yes;
  }
  std::atomic<std::uint64_t> events = 0;
};

struct Cost {
  double share;  // of a core
  double wakesPerSecond;
  double eventsPerSecond;
};

Cost measure(const Counter& counter) {
  const auto time = processorTime();
  const auto wakes = wakeUps();
  const auto events = counter.events.load();
  std::this_thread::sleep_for(kMeasured);
  const double seconds = std::chrono::duration<double>(kMeasured).count();
  return {std::chrono::duration<double>(processorTime() - time).count() / seconds,
          // the measuring thread's own wake-up is none of the source's
          static_cast<double>(wakeUps() - wakes - 1) / seconds,
          static_cast<double>(counter.events - events) / seconds};
}

int run(const std::vector<std::string>& files) {
  const auto packets = packetsOf(files);
  int name[2];
  int orders[2];
  if (packets.empty() || ::pipe(name) != 0 || ::pipe(orders) != 0) {
    std::fputs("port-cost RAW-LOG…\n", stderr);
    return 64;
  }
  const pid_t modem = ::fork();
  if (modem == 0) beModem(packets, name[1], orders[0]);
  std::string path(64, '\0');
  path.resize(static_cast<std::size_t>(::read(name[0], path.data(), path.size())));

  const auto counter = std::make_shared<Counter>();
  const auto listeners = std::make_shared<sources::ListenerSignal>();
  diagnostics::DiagnosticsSource source({path, 1});
  source.start(counter, listeners);
  std::this_thread::sleep_for(kWarmUp);
  const Cost busy = measure(*counter);
  [[maybe_unused]] const auto told = ::write(orders[1], "q", 1);
  std::this_thread::sleep_for(kWarmUp);
  const Cost idle = measure(*counter);
  source.stop();
  printRow("a modem's port at 30 packets/s",
           text(100 * busy.share, "% of a core, ") + text(busy.wakesPerSecond, "wake-ups and ", 1) +
               text(busy.eventsPerSecond, "events a second", 1),
           "", "< 0.5 %");
  printRow("the same port when the modem says nothing: wake-ups a second",
           text(idle.wakesPerSecond, "", 2), "", "none");
  ::kill(modem, SIGKILL);
  return 0;
}

}  // namespace
}  // namespace qel::benchmarks

int main(int count, char** arguments) {
  return qel::benchmarks::run({arguments + 1, arguments + count});
}
