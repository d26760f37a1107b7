// SIGSTOP, a while of nothing, SIGCONT.

#include <array>
#include <csignal>
#include <thread>

#include "harness/Caller.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"

namespace qel::trials {
namespace {

constexpr milliseconds kAnswersWithin{100};

Cast everybody() { return {.viewer = true, .recorder = true}; }

milliseconds randomPause(Trial& trial) { return milliseconds(200 + trial.below(5800)); }

void expectEverythingBack(Stand& stand, const std::string& after) {
  stand.expectValuesBack(after, Clock::now());
  stand.expectAllAlive(after);
  stand.expectConfigurationsKept(after);
  stand.lookAtMemory(after);
}

}  // namespace

void stopService(Trial& trial) {
  Stand stand(trial, everybody());
  for (int i = 0; i < trial.times; ++i) {
    stand.service().process().signal(SIGSTOP);
    std::this_thread::sleep_for(randomPause(trial));
    stand.service().process().signal(SIGCONT);
    ++trial.figures.tried;
    expectEverythingBack(stand, "after the service stood still");
  }
  stand.expectAllToEnd();
}

void stopBus(Trial& trial) {
  Stand stand(trial, everybody());
  for (int i = 0; i < trial.times; ++i) {
    stand.bus().signal(SIGSTOP);
    std::this_thread::sleep_for(randomPause(trial));
    stand.bus().signal(SIGCONT);
    ++trial.figures.tried;
    expectEverythingBack(stand, "after the bus stood still");
  }
  stand.expectAllToEnd();
}

// The service goes on for the others meanwhile.
void stopWatchers(Trial& trial) {
  Stand stand(trial, everybody());
  Caller caller(stand.bus().address());
  const std::array<Program*, 3> watchers = {&stand.viewer(), &stand.screen(), &stand.recorder()};
  for (int i = 0; i < trial.times; ++i) {
    Program& watcher = *watchers[static_cast<std::size_t>(trial.below(watchers.size()))];
    const std::string after = "after the " + watcher.name() + " stood still";
    caller.longestWait();
    watcher.process().signal(SIGSTOP);
    std::this_thread::sleep_for(randomPause(trial));
    const auto waited = caller.longestWait();
    watcher.process().signal(SIGCONT);
    ++trial.figures.tried;
    trial.figures.sawWait(waited);
    promise(waited <= trial.stretched(kAnswersWithin),
            "others are answered in time while the " + watcher.name() +
                " stands still: " + std::to_string(waited.count()) + " ms");
    expectEverythingBack(stand, after);
  }
  stand.expectAllToEnd();
}

}  // namespace qel::trials
