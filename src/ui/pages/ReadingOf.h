// The newest value of a quantity, ready to be shown.
#pragma once

#include <cstdint>
#include <optional>

#include "history/Viewpoint.h"
#include "ui/pages/Reading.h"

namespace qel {

// A reading and what it was made of. Without a point nothing was ever measured.
struct MadeReading {
  Reading reading;
  std::optional<Point> point;
  std::optional<std::uint64_t> changesAtMs;  // when its age reads differently; none: never
};

MadeReading readingOf(const Viewpoint& viewpoint, Quantity quantity);

// The age that makes a value old: twice the usual distance of its points.
std::uint64_t oldAfterMs(const std::vector<Run>& runs);

// What the pages look back to for that, and for a sparkline.
inline constexpr std::uint64_t kGlanceMs = 2 * 60 * 1000;

}  // namespace qel
