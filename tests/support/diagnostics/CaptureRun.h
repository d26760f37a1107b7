// Raw logs of real modems and what is known to be in them, from the folder that QEL_DIAG_CAPTURES
// names.
#pragma once

#include <cstdint>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "base/Bytes.h"

namespace qel::diagnostics::test {

// What a packet told about a metric.
struct ToldMetric {
  std::size_t number = 0;  // of the packet, from 1
  std::uint64_t timeMs = 0;
  std::uint32_t metric = 0;
  Bytes payload;
};

// Empty without the folder.
std::vector<std::string> captureNames();

// All that is made of that raw log; a modem with two radios has a reader for each.
std::vector<ToldMetric> readCapture(const std::string& name);

// One entry a fact.
std::vector<nlohmann::json> factsOf(const std::string& name);

}  // namespace qel::diagnostics::test
