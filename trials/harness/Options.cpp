#include "harness/Options.h"

#include <sysexits.h>

#include <CLI/CLI.hpp>

namespace qel::trials {

std::optional<Options> parseOptions(int argc, const char* const* argv, int& exitCode) {
  Options options;
  CLI::App app(
      "Kills, stops, floods and deceives the programs, and looks whether they keep what "
      "they promise",
      "faults");
  app.add_option("SCENARIO,--scenario", options.scenarios, "Only these");
  app.add_option("--seed", options.seed, "Makes the same choices again");
  app.add_option("--times", options.times, "So often, each scenario")
      ->check(CLI::Range(1, 1000000));
  app.add_option("--slack", options.slack, "Stretches every deadline so many times")
      ->check(CLI::Range(1.0, 1000.0))
      ->capture_default_str();
  app.add_flag("--quick", options.quick, "A short round, for less than a minute");
  app.add_flag("--list", options.list, "Name the scenarios and end");
  try {
    app.parse(argc, argv);
  } catch (const CLI::ParseError& error) {
    exitCode = app.exit(error) == 0 ? 0 : EX_USAGE;
    return std::nullopt;
  }
  return options;
}

}  // namespace qel::trials
