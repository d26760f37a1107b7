#include "service/daemon/Options.h"

#include <sysexits.h>

#include <CLI/CLI.hpp>

#include "base/TerminalText.h"

namespace qel::service {

std::optional<Options> parseOptions(int argc, const char* const* argv, int& exitCode) {
  CLI::App app("The baseband manager service", "basebandd");
  Options options;
  app.set_version_flag("--version", "basebandd " QEL_VERSION);
  app.add_option("--source", options.source,
                 "Where events come from: simulated[,seed=N][,speed=N], "
                 "recording:FILE[,speed=N][,loop], modem-manager[:IMEI|:PATH][,bus=ADDRESS], "
                 "diag[:PORT][,radio=N][+modem-manager...], diag:FILE[,speed=N][,radio=N] or "
                 "auto[,bus=ADDRESS]")
      ->capture_default_str();
  app.add_option("--bus", options.bus, "system, session or a bus address")->capture_default_str();
  auto* state =
      app.add_option("--state", options.stateDirectory,
                     "Directory in which configurations outlive the service; unless given, "
                     "$STATE_DIRECTORY, else basebandd in $XDG_STATE_HOME, else "
                     "~/.local/state/basebandd")
          ->check(CLI::ExistingDirectory);
  bool forgets = false;
  app.add_flag("--no-state", forgets, "Keep nothing: configurations end with the service")
      ->excludes(state);
  app.add_flag("-v,--verbose", options.verbose, "Log on standard error too");
  try {
    app.parse(argc, argv);
  } catch (const CLI::Success& success) {
    exitCode = app.exit(success);
    return std::nullopt;
  } catch (const CLI::ParseError& error) {
    const std::string text = error.what();
    complain("basebandd", "usage: " + text.substr(0, text.find('\n')));
    exitCode = EX_USAGE;
    return std::nullopt;
  }
  options.keepsState = !forgets;
  return options;
}

}  // namespace qel::service
