// Clients that ask for too much, while others want to be served.

#include <csignal>
#include <list>
#include <thread>

#include "harness/Attack.h"
#include "harness/Caller.h"
#include "harness/Requests.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr milliseconds kAnswersWithin{100};
constexpr std::int64_t kAttackersApplication = 1000;

// One second of attack for each of the times. Values come, others are served, memory stays and
// SIGTERM is obeyed during it; then the service starts again with what it was asked to keep.
void attack(Trial& trial, std::size_t attackers, const Attack::Deed& deed) {
  Stand stand(trial, {});
  Caller caller(stand.bus().address());
  Caller withoutService(stand.bus().address(), Caller::Asked::bus);
  std::this_thread::sleep_for(500ms);
  caller.longestWait();
  withoutService.longestWait();
  std::list<Attack> attacks;
  for (std::size_t i = 0; i < attackers; ++i) attacks.emplace_back(stand.bus().address(), deed);
  for (int i = 0; i < trial.times; ++i) {
    std::this_thread::sleep_for(1s);
    ++trial.figures.tried;
    const auto waited = caller.longestWait();
    trial.figures.sawWait(waited);
    trial.figures.sawBusWait(withoutService.longestWait());
    stand.expectAllAlive("during the flood");
    stand.lookAtMemory("during the flood");
    promise(
        waited <= trial.stretched(kAnswersWithin),
        "others are answered in time during the flood: " + std::to_string(waited.count()) + " ms");
  }
  stand.expectValues("during the flood");
  stand.expectConfigurationsKept("during the flood");
  stand.expectToEnd(stand.service(), "during the flood");
  attacks.clear();
  const auto start = Clock::now();
  stand.service().process().start();
  stand.expectValuesBack("after the flood", start);
  stand.expectConfigurationsKept("after the flood");
  stand.expectAllToEnd();
}

// As fast as the bus takes it: only one in many waits for its answer, lest the calls pile up here.
void switchDelivery(sdbus::IConnection&, Proxy& proxy) {
  constexpr int kAtOnce = 500;
  for (int i = 0; i < kAtOnce; ++i) {
    proxy.raw()
        .callMethod("SetDelivery")
        .onInterface(tesk::BasebandManager1_proxy::INTERFACE_NAME)
        .withArguments(true)
        .dontExpectReply();
  }
  proxy.SetDelivery(true);
}

void registerWithHugeName(sdbus::IConnection&, Proxy& proxy) {
  static std::atomic<int> calls = 0;
  constexpr std::size_t kNameBytes = 8 * 1000 * 1000;
  proxy.Register(std::to_string(calls++) + std::string(kNameBytes, 'x'));
}

void install(Proxy& proxy, std::int64_t application, const Bytes& payload) {
  proxy.PerformCommand("kCommandAddConfiguration", installRequest(application, payload));
}

}  // namespace

void floodOfDelivery(Trial& trial) { attack(trial, 1, switchDelivery); }
void floodOfDeliveryByThree(Trial& trial) { attack(trial, 3, switchDelivery); }
void floodOfNames(Trial& trial) { attack(trial, 1, registerWithHugeName); }

void floodOfConfigurations(Trial& trial) {
  attack(trial, 1, [payload = configurationOfTriggers(500000)](sdbus::IConnection&, Proxy& proxy) {
    install(proxy, kAttackersApplication, payload);
  });
}

void floodOfApplications(Trial& trial) {
  attack(trial, 1,
         [payload = configurationOfTriggers(45000), application = std::int64_t{0}](
             sdbus::IConnection&, Proxy& proxy) mutable {
           install(proxy, kAttackersApplication + application++ % 1000, payload);
         });
}

void floodOfAlternation(Trial& trial) {
  attack(trial, 1,
         [one = configurationOfMetrics(1), two = configurationOfMetrics(2)](sdbus::IConnection&,
                                                                            Proxy& proxy) {
           install(proxy, kAttackersApplication, one);
           install(proxy, kAttackersApplication, two);
         });
}

void floodOfTags(Trial& trial) {
  attack(trial, 1, [payload = payloadOfMetricTags(1200000)](sdbus::IConnection&, Proxy& proxy) {
    install(proxy, kAttackersApplication, payload);
  });
}

}  // namespace qel::trials
