// Which of two sources is the better one for a metric.
#pragma once

#include <algorithm>
#include <array>
#include <cstdint>

namespace qel::sources {

// A modem's diagnostics port, and ModemManager.
enum class SourcePart : std::uint8_t { port, manager };

// What ModemManager reads from the SIM at once and the port only overhears, and the connections,
// whose addresses ModemManager knows of other programs too. All else is the radio's.
inline constexpr std::array<std::uint32_t, 3> kBetterFromManager = {
    19,     // SIM files
    54537,  // identities of the subscriber
    54541,  // packet connections
};

constexpr SourcePart betterPart(std::uint32_t metric) {
  return std::ranges::find(kBetterFromManager, metric) == kBetterFromManager.end()
             ? SourcePart::port
             : SourcePart::manager;
}

constexpr SourcePart otherThan(SourcePart part) {
  return part == SourcePart::port ? SourcePart::manager : SourcePart::port;
}

}  // namespace qel::sources
