// Sources that send more than anybody can take.

#include <thread>

#include "harness/Caller.h"
#include "harness/Processes.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr milliseconds kAnswersWithin{100};
constexpr std::uint64_t kViewersMostKb = 256 * 1024;

void watch(Trial& trial, Stand& stand, Program& program) {
  const auto most = mostResidentKb(program.process().pid());
  trial.figures.remarks.push_back(program.name() + " had " + std::to_string(most / 1024) + " MiB");
  promise(most < kViewersMostKb, "the " + program.name() + "'s memory is bound while a source " +
                                     "floods: it had " + std::to_string(most) + " KiB");
  stand.expectToEnd(program, "while a source floods");
}

void flood(Trial& trial, const std::string& source) {
  Stand stand(trial, {.viewer = true, .source = source, .viewersLines = "/dev/null"});
  Caller caller(stand.bus().address());
  std::this_thread::sleep_for(500ms);
  caller.longestWait();
  for (int i = 0; i < trial.times; ++i) {
    std::this_thread::sleep_for(1s);
    ++trial.figures.tried;
    const auto waited = caller.longestWait();
    trial.figures.sawWait(waited);
    stand.lookAtMemory("while a source floods");
    promise(waited <= trial.stretched(kAnswersWithin),
            "clients are answered in time while a source floods: " +
                std::to_string(waited.count()) + " ms");
  }
  stand.expectValues("while a source floods");
  stand.expectAllAlive("while a source floods");
  stand.expectConfigurationsKept("while a source floods");
  watch(trial, stand, stand.viewer());
  stand.expectToEnd(stand.service(), "while its source floods");
  const auto start = Clock::now();
  stand.startService("simulated,speed=50");
  stand.expectValuesBack("after the source's flood", start);
  stand.expectConfigurationsKept("after the source's flood");
  watch(trial, stand, stand.screen());
  stand.expectAllToEnd();
}

}  // namespace

void floodOfRecording(Trial& trial) {
  flood(trial, std::string("recording:") + QEL_SAMPLE + ",speed=1000000,loop");
}

void floodOfDrive(Trial& trial) { flood(trial, "simulated,speed=1000000"); }

}  // namespace qel::trials
