// Runs a program of the build and keeps what it said.
#pragma once

#include <string>
#include <vector>

namespace qel::testing {

struct Outcome {
  int exitCode = -1;  // -1 when a signal ended it
  int signal = 0;
  std::string out;
  std::string err;
};

// The program gets `input` as standard input and the test's environment. It is waited for.
Outcome run(const std::string& program, const std::vector<std::string>& arguments,
            const std::string& input = "");

}  // namespace qel::testing
