// Pieces of system information that have come, until they are whole.
#pragma once

#include <array>
#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace qel::diagnostics {

// A block of which not all segments have come: 16 segments of 222 bits at most.
struct UmtsPart {
  unsigned count = 0;  // of all segments
  unsigned next = 0;   // the segment that must come now
  Bytes bytes;
  std::size_t bits = 0;
  // Of the segment that came last.
  std::uint64_t timeMs = 0;
  unsigned sfnPrime = 0;
};

struct UmtsSegments {
  static constexpr std::size_t kTypes = 32;

  std::array<std::optional<UmtsPart>, kTypes> parts;
  Bytes master;  // the master block: another one says that this is another cell, or other content
};

}  // namespace qel::diagnostics
