// What the trials have shown, for the terminal and as a table in Markdown.
#pragma once

#include <string>
#include <vector>

#include "harness/Trial.h"

namespace qel::trials {

struct Result {
  const Scenario* scenario = nullptr;
  Figures figures;
  std::string broken;    // the promise; empty: all kept
  std::string notTried;  // why not, if so
};

std::string lineOf(const Result& result);
std::string tableOf(const std::vector<Result>& results);

}  // namespace qel::trials
