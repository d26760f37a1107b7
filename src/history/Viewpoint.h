// Which values a page shows, and of which moment.
#pragma once

#include <cstdint>

#include "history/History.h"
#include "metrics/MetricStore.h"

namespace qel {

// The live ones now, or those of a recording at a moment of it. Held by who owns both; main thread.
struct Viewpoint {
  const History* history = nullptr;
  const MetricStore* store = nullptr;
  std::uint64_t nowMs = 0;
  bool isLive = true;
};

}  // namespace qel
