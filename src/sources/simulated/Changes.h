// What a step of the drive has changed.
#pragma once

#include <algorithm>
#include <cstdint>
#include <vector>

namespace qel::sources {

// Trigger identifiers of the simulated modem.
enum class Trigger : std::uint32_t {
  cellChange = 0x7E0001,
  handover = 0x7E0002,
  technologyChange = 0x7E0003,
  connectionSetUp = 0x7E0004,
  connectionReleased = 0x7E0005,
  radioLinkFailure = 0x7E0006,
  registered = 0x7E0007,
  carriersChanged = 0x7E0008,
};

// In the order in which they came, each metric once.
struct Changes {
  std::vector<Trigger> triggers;
  std::vector<std::uint32_t> metrics;  // 16-bit identifiers: report now

  void report(std::uint32_t metric) {
    if (std::ranges::find(metrics, metric) == metrics.end()) metrics.push_back(metric);
  }
};

}  // namespace qel::sources
