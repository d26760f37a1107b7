// A stretch of the simulated drive, decoded.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "base/Value.h"
#include "service/EventSubject.h"

namespace qel::testing {

inline constexpr std::uint64_t kDriveStartMs = 1'700'000'000'000;

// Payloads that do not decode are a failure of the test.
struct DriveEvent {
  std::uint64_t elapsedMs = 0;
  std::uint32_t metric = 0;  // 16 bits; 0 for a trigger
  std::int64_t trigger = 0;
  Dictionary message;  // empty for a metric without message class
  sources::SourceEvent raw;
};

// Shared by the tests of one process.
const std::vector<DriveEvent>& drive(std::uint64_t seed, std::uint64_t durationMs = 600'000);

// Only those of the metric.
std::vector<DriveEvent> driveOf(std::uint64_t seed, std::uint32_t metric);

std::int64_t integerOf(const Dictionary& dictionary, std::string_view key);
std::string_view textOf(const Dictionary& dictionary, std::string_view key);
// The dictionaries in the list under the key; none when there is no such list.
std::vector<Dictionary> entriesOf(const Dictionary& dictionary, std::string_view key);

}  // namespace qel::testing
