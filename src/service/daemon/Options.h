// What the command line of the service asks for.
#pragma once

#include <optional>
#include <string>

namespace qel::service {

struct Options {
  std::string source = "simulated";
  std::string bus = "system";
  std::string stateDirectory;  // empty: where the environment says
  bool keepsState = true;
  bool verbose = false;
};

// Nothing when the program is to end at once, with that exit code: help and version were printed,
// or what is wrong with the line, on standard error.
std::optional<Options> parseOptions(int argc, const char* const* argv, int& exitCode);

}  // namespace qel::service
