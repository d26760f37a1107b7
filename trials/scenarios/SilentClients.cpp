// As many clients as the service takes, none of which reads.

#include <list>
#include <thread>

#include "harness/Caller.h"
#include "harness/Proxy.h"
#include "harness/Requests.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr milliseconds kAnswersWithin{100};
constexpr int kMost = 80;  // more than the service takes
constexpr std::int64_t kViewersApplication = 2;

struct SilentClient {
  explicit SilentClient(const std::string& bus) : connection(tesk::bus::connectTo({bus})) {
    events = proxy.Register("trial-silent");
    proxy.PerformCommand("kCommandAddConfiguration",
                         installRequest(kViewersApplication, viewersConfiguration()));
    proxy.SetDelivery(true);
  }

  std::unique_ptr<sdbus::IConnection> connection;
  Proxy proxy{*connection};
  sdbus::UnixFd events;
};

// How many it took.
std::size_t fill(std::list<SilentClient>& clients, const std::string& bus) {
  try {
    while (clients.size() < kMost) clients.emplace_back(bus);
  } catch (const sdbus::Error&) {  // the service is full
  }
  return clients.size();
}

}  // namespace

void silentClients(Trial& trial) {
  Stand stand(trial, {.source = "simulated,speed=100"});
  Caller caller(stand.bus().address());
  std::this_thread::sleep_for(500ms);
  std::list<SilentClient> clients;
  trial.figures.tried += fill(clients, stand.bus().address());
  caller.longestWait();
  for (int i = 0; i < trial.times; ++i) {
    std::this_thread::sleep_for(1s);
    const auto waited = caller.longestWait();
    trial.figures.sawWait(waited);
    stand.lookAtMemory("while nobody reads");
    promise(waited <= trial.stretched(kAnswersWithin),
            "others are answered in time while nobody reads: " + std::to_string(waited.count()) +
                " ms");
  }
  stand.expectValues("while nobody reads");
  stand.expectAllAlive("while nobody reads");
  stand.expectToEnd(stand.service(), "while nobody reads");
  clients.clear();
  const auto start = Clock::now();
  stand.service().process().start();
  stand.expectValuesBack("after nobody read", start);
  stand.expectConfigurationsKept("after nobody read");
  stand.expectAllToEnd();
}

}  // namespace qel::trials
