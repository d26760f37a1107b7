// What the command line asks for.
#pragma once

#include <optional>
#include <string>

#include "recording/privacy/EventLog.h"
#include "ui/quick/Appearance.h"

namespace qel {

struct Options {
  std::string source;  // of a service within this process; empty: the service on the bus
  std::string bus = "system";
  std::string picture;  // file name; empty: keep none
  std::optional<Appearance::Theme> theme;
  LoggedEvents loggedEvents = LoggedEvents::full;  // in the system log
  bool selfTest = false;
  bool verbose = false;  // what goes to the system log goes to standard error too
};

// Nothing when the program is to end at once, with that exit code: help and version were printed,
// or what is wrong with the line, on standard error.
std::optional<Options> parseOptions(int argc, const char* const* argv, int& exitCode);

}  // namespace qel
