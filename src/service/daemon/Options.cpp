#include "service/daemon/Options.h"

#include <sysexits.h>

#include <CLI/CLI.hpp>
#include <iostream>

namespace qel::service {

std::optional<Options> parseOptions(int argc, const char* const* argv, int& exitCode) {
  CLI::App app("The baseband manager service", "basebandd");
  Options options;
  app.set_version_flag("--version", "basebandd " QEL_VERSION);
  app.add_option("--source", options.source,
                 "Where events come from: simulated[,seed=N][,speed=N], "
                 "recording:FILE[,speed=N][,loop] or "
                 "modem-manager[:IMEI|:PATH][,bus=ADDRESS]")
      ->capture_default_str();
  app.add_option("--bus", options.bus, "system, session or a bus address")->capture_default_str();
  app.add_option("--state", options.stateDirectory,
                 "Directory in which configurations outlive the service")
      ->check(CLI::ExistingDirectory);
  app.add_flag("-v,--verbose", options.verbose, "Log on standard error too");
  try {
    app.parse(argc, argv);
  } catch (const CLI::Success& success) {
    exitCode = app.exit(success);
    return std::nullopt;
  } catch (const CLI::ParseError& error) {
    const std::string text = error.what();
    std::cerr << "basebandd: usage: " << text.substr(0, text.find('\n')) << '\n';
    exitCode = EX_USAGE;
    return std::nullopt;
  }
  return options;
}

}  // namespace qel::service
