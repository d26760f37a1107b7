#include "app/Options.h"

#include <sysexits.h>

#include <CLI/App.hpp>
#include <CLI/Config.hpp>
#include <CLI/Formatter.hpp>
#include <CLI/Validators.hpp>
#include <map>

#include "base/TerminalText.h"
#include "bus/BusAddress.h"

namespace qel {
namespace {

const std::map<std::string, Appearance::Theme>& themes() {
  static const std::map<std::string, Appearance::Theme> names = {
      {"system", Appearance::System}, {"light", Appearance::Light}, {"dark", Appearance::Dark}};
  return names;
}

}  // namespace

std::optional<Options> parseOptions(int argc, const char* const* argv, int& exitCode) {
  Options options;
  std::string theme;
  std::string events = "full";
  CLI::App line("Shows what the phone's baseband reports about its cells.", "qelwatch");
  line.set_version_flag("--version", "qelwatch " QELWATCH_VERSION);
  auto* source = line.add_option("--source", options.source,
                                 "values from within, without the baseband manager service: "
                                 "simulated[,seed=N][,speed=N], recording:FILE[,speed=N][,loop], "
                                 "diag[:PORT], diag:FILE[,speed=N], modem-manager[:IMEI|:PATH] or "
                                 "auto")
                     ->type_name("SOURCE");
  line.add_option("--bus", options.bus,
                  "where the baseband manager service is: system, session or a bus address")
      ->type_name("BUS")
      ->check([](const std::string& name) { return bus::faultOfBusName(name); })
      ->capture_default_str()
      ->excludes(source);
  line.add_option("--theme", theme, "system, light or dark, for this run")
      ->type_name("THEME")
      ->check(CLI::IsMember(themes()).description(""));
  line.add_option("--picture", options.picture,
                  "keep a PNG picture of the current screen in this file")
      ->type_name("FILE");
  line.add_option("--event-log", events,
                  "events in the system log: full (with the identities in them), hidden (with "
                  "pseudonyms) or none")
      ->type_name("EVENTS")
      ->check(CLI::IsMember(loggedEventsNames()).description(""))
      ->capture_default_str();
  line.add_flag("--self-test", options.selfTest, "open and draw every screen once, then end");
  line.add_flag("-v,--verbose", options.verbose,
                "what goes to the system log goes to standard error too");
  try {
    line.parse(argc, argv);
  } catch (const CLI::Success& answered) {
    exitCode = line.exit(answered);
    return std::nullopt;
  } catch (const CLI::ParseError& error) {
    const std::string text = error.what();
    complain("qelwatch", text.substr(0, text.find('\n')));
    exitCode = EX_USAGE;
    return std::nullopt;
  }
  options.loggedEvents = *loggedEventsNamed(events);
  if (!theme.empty()) options.theme = themes().at(theme);
  return options;
}

}  // namespace qel
