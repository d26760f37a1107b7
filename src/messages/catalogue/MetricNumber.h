// Numbers that events give to metrics.
#pragma once

#include <cstdint>
#include <optional>

#include "messages/catalogue/KBBMetricUtility.h"

namespace qel {

// The catalogue identifier that an event's number stands for; nothing when it is no metric's.
constexpr std::optional<std::uint32_t> metricOfNumber(std::int64_t number) {
  constexpr std::int64_t kSmallest{kMetricEventBase};
  constexpr std::int64_t kLargest = kSmallest + 0xFFFF;
  if (number < kSmallest || number > kLargest) return std::nullopt;
  return static_cast<std::uint32_t>(number - kSmallest);
}

}  // namespace qel
