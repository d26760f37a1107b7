// The names by which the baseband's events go. Each one's text is its own name.
#pragma once

#include <string_view>

namespace tesk {

// Event streams.
inline constexpr std::string_view kEventTrigger = "kEventTrigger";
inline constexpr std::string_view kEventMetric = "kEventMetric";

// Keys of events.
inline constexpr std::string_view kKeyPayload = "kKeyPayload";
inline constexpr std::string_view kKeyTriggerID = "kKeyTriggerID";
inline constexpr std::string_view kKeyProfileID = "kKeyProfileID";
inline constexpr std::string_view kKeyMetricID = "kKeyMetricID";

}  // namespace tesk
