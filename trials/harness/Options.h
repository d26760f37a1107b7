// What the command line of the trials asks for.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace qel::trials {

struct Options {
  std::vector<std::string> scenarios;  // empty: all
  std::optional<std::uint64_t> seed;
  std::optional<int> times;
  double slack = 1;
  bool quick = false;
  bool list = false;
};

// Nothing when the program is to end at once, with that exit code.
std::optional<Options> parseOptions(int argc, const char* const* argv, int& exitCode);

}  // namespace qel::trials
