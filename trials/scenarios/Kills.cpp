// kill -9 at random moments, under load.

#include <csignal>
#include <thread>

#include "harness/Caller.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"
#include "support/Subprocess.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr auto kSupervisorWaits = 1s;  // RestartSec of the unit

Cast everybody() { return {.viewer = true, .recorder = true}; }

void waitForRandomMoment(Trial& trial) {
  std::this_thread::sleep_for(milliseconds(trial.below(400)));
}

void killAndRestart(Program& program, milliseconds pause) {
  program.process().signal(SIGKILL);
  program.process().waitForEnd();
  std::this_thread::sleep_for(pause);
  program.process().start();
}

template <class Fault>
void repeat(Trial& trial, const std::string& after, Fault fault) {
  Stand stand(trial, everybody());
  for (int i = 0; i < trial.times; ++i) {
    waitForRandomMoment(trial);
    const auto start = Clock::now();
    fault(stand);
    ++trial.figures.tried;
    stand.expectValuesBack(after, start);
    stand.expectAllAlive(after);
    stand.expectConfigurationsKept(after);
    stand.lookAtMemory(after);
  }
  stand.expectAllToEnd();
}

}  // namespace

void killService(Trial& trial) {
  repeat(trial, "after the service was killed",
         [](Stand& stand) { killAndRestart(stand.service(), kSupervisorWaits); });
}

void killBus(Trial& trial) {
  repeat(trial, "after the bus was killed", [](Stand& stand) {
    stand.bus().kill();
    stand.bus().start();
  });
}

void killViewer(Trial& trial) {
  repeat(trial, "after the viewer was killed",
         [](Stand& stand) { killAndRestart(stand.viewer(), 0ms); });
}

// What was recorded until then can be read.
void killRecorder(Trial& trial) {
  repeat(trial, "after the recorder was killed", [](Stand& stand) {
    stand.recorder().process().signal(SIGKILL);
    stand.recorder().process().waitForEnd();
    const auto read = testing::run(QEL_QELCTL, {"store", stand.recording()});
    promise(read.exitCode == 0, "what a killed recorder has recorded can be read: " + read.err);
    stand.recorder().process().start();
  });
}

}  // namespace qel::trials
