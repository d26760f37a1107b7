// faults [SCENARIO…]: does to the programs what the world may do to them.

#include <algorithm>
#include <array>
#include <cstdlib>
#include <iostream>
#include <random>

#include "harness/Mounts.h"
#include "harness/Options.h"
#include "harness/Report.h"
#include "scenarios/Scenarios.h"

namespace qel::trials {
namespace {

constexpr std::array kScenarios = {
    Scenario{"kill-service", "service killed", 250, 2, killService},
    Scenario{"kill-bus", "bus killed", 250, 1, killBus},
    Scenario{"kill-viewer", "viewer killed", 250, 1, killViewer},
    Scenario{"kill-recorder", "recorder killed", 250, 1, killRecorder},
    Scenario{"kill-broker", "broker killed", 50, 2, killBroker},
    Scenario{"kill-publisher", "publisher killed", 50, 3, killPublisher},
    Scenario{"kill-collector", "collector killed", 50, 2, killCollector},
    Scenario{"kill-collected-broker", "broker of collectors killed", 50, 2, killBrokerOfCollectors},
    Scenario{"kill-database", "database killed", 20, 1, killDatabase},
    Scenario{"stop-service", "service stopped for up to 6 s", 20, 0, stopService},
    Scenario{"stop-bus", "bus stopped for up to 6 s", 20, 0, stopBus},
    Scenario{"stop-watchers", "viewer, `live` or recorder stopped for up to 6 s", 30, 0,
             stopWatchers},
    Scenario{"flood-delivery", "`SetDelivery` at full speed, seconds", 20, 2, floodOfDelivery},
    Scenario{"flood-delivery-3", "the same from three clients, seconds", 20, 0,
             floodOfDeliveryByThree},
    Scenario{"flood-names", "`Register` with names of 8 MB, seconds", 20, 1, floodOfNames},
    Scenario{"flood-configurations", "configurations of 500,000 triggers, seconds", 20, 1,
             floodOfConfigurations},
    Scenario{"flood-applications", "200 kB under ever new applications, seconds", 20, 0,
             floodOfApplications},
    Scenario{"flood-alternation", "two configurations in turn, seconds", 20, 0, floodOfAlternation},
    Scenario{"flood-tags", "configurations of 400,000 metric tags, seconds", 20, 0, floodOfTags},
    Scenario{"silent-clients", "as many clients as there is room for, none reads", 20, 2,
             silentClients},
    Scenario{"flood-recording", "recording in a loop at speed 1000000, seconds", 20, 2,
             floodOfRecording},
    Scenario{"flood-drive", "simulated drive at speed 1000000, seconds", 20, 0, floodOfDrive},
    Scenario{"lying-services", "a hanging or lying service in its place", 18, 3, lyingServices},
    Scenario{"full-disk", "disk full", 5, 1, fullDisk},
    Scenario{"full-queue", "disk of events that wait for the broker full", 5, 1, fullQueueDisk},
    Scenario{"short-files", "files that may not grow, `/dev/full`", 5, 1, shortFiles},
    Scenario{"jumping-clock", "clock forward and back", 12, 2, jumpingClock},
    Scenario{"moving-zone", "time zone changed", 6, 1, movingZone},
};

bool isWanted(const Scenario& scenario, const Options& options) {
  if (options.scenarios.empty()) return !options.quick || scenario.quickTimes > 0;
  return std::ranges::find(options.scenarios, scenario.name) != options.scenarios.end();
}

bool areKnown(const std::vector<std::string>& names) {
  for (const std::string& name : names) {
    if (std::ranges::none_of(kScenarios, [&](const auto& known) { return name == known.name; })) {
      std::cerr << "faults: no scenario is called " << name << " (--list names them)\n";
      return false;
    }
  }
  return true;
}

Result tryOut(const Scenario& scenario, const Options& options, std::uint64_t seed) {
  const int usual = options.quick ? std::max(1, scenario.quickTimes) : scenario.times;
  Trial trial(seed, options.times.value_or(usual), options.slack);
  Result result{&scenario, {}, {}, {}};
  try {
    scenario.run(trial);
  } catch (const BrokenPromise& broken) {
    result.broken = broken.what();
  } catch (const NotPossibleHere& reason) {
    result.notTried = reason.what();
  } catch (const std::exception& error) {
    result.broken = std::string("nothing else fails: ") + error.what();
  }
  result.figures = std::move(trial.figures);
  return result;
}

int run(const Options& options) {
  if (!areKnown(options.scenarios)) return 64;
  const std::uint64_t seed = options.seed.value_or(std::random_device()());
  std::cout << "seed " << seed << std::endl;
  std::vector<Result> results;
  for (const Scenario& scenario : kScenarios) {
    if (!isWanted(scenario, options)) continue;
    results.push_back(tryOut(scenario, options, seed));
    std::cout << lineOf(results.back()) << std::endl;
  }
  std::cout << '\n' << tableOf(results);
  const bool allKept = std::ranges::all_of(results, &std::string::empty, &Result::broken);
  return allKept ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace
}  // namespace qel::trials

int main(int argc, char** argv) {
  int exitCode = EXIT_SUCCESS;
  const auto options = qel::trials::parseOptions(argc, argv, exitCode);
  if (!options) return exitCode;
  if (options->list) {
    for (const auto& scenario : qel::trials::kScenarios) {
      std::cout << scenario.name << ": " << scenario.what << '\n';
    }
    return EXIT_SUCCESS;
  }
  qel::trials::separateMounts();
  return qel::trials::run(*options);
}
