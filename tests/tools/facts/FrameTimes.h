// When the frames of a raw log were stamped, read apart from the product.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace qel::testing {

// Milliseconds since 1970 by the modem's clock. Several in a frame of events; first > last: none.
struct FrameTime {
  std::uint64_t firstMs = 1;
  std::uint64_t lastMs = 0;

  bool holds(std::uint64_t ms) const { return ms + 1 >= firstMs && ms <= lastMs + 1; }
};

// Of the good frames in their order, repaired ones too. Times before 2010 are of a clock that was
// not set: they count from when the file was last written to.
std::vector<FrameTime> frameTimes(const std::string& path);

}  // namespace qel::testing
