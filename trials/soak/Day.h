// A recording of a long drive, made of the sample drive again and again.
#pragma once

#include <cstdint>
#include <string>

namespace qel::trials {

struct Day {
  std::uint64_t metrics = 0;
  std::uint64_t triggers = 0;
  std::uint64_t leadIn = 0;  // events before the drive that no configuration asks for
  double seconds = 0;        // how long it takes at its own pace

  std::uint64_t wanted() const { return metrics + triggers; }
  std::uint64_t all() const { return wanted() + leadIn; }
};

// Clients that come during the lead-in, which lasts so many seconds, hear all of the drive. Throws
// std::runtime_error when the sample cannot be read or the file not be written.
Day writeDay(const std::string& file, double hours, double leadInSeconds);

}  // namespace qel::trials
