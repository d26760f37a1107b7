// What the service takes from its clients, at most.
#pragma once

#include <cstddef>
#include <cstdint>

namespace qel::service::limits {

// One configuration. That of the viewer has 270 bytes.
inline constexpr std::size_t kPayloadBytes = 4096;
inline constexpr std::size_t kConfigurationEntries = 512;  // metrics and triggers together

// All configurations that are installed.
inline constexpr std::size_t kApplicationsOfOneClient = 8;
inline constexpr std::size_t kApplications = 64;
inline constexpr std::size_t kAllPayloadBytes = 128 * 1024;

// Clients whose application is remembered, by name.
inline constexpr std::size_t kRememberedClients = 256;
inline constexpr std::size_t kClientNameBytes = 64;
// What a client installed that did not come back for so long gives way to others.
inline constexpr std::uint64_t kLongGoneMs = 24ULL * 60 * 60 * 1000;

}  // namespace qel::service::limits
