// The names that the baseband manager and its clients share. Each one's text is its own name.
#pragma once

#include <cstdint>
#include <string_view>

namespace tesk {

// Event streams.
inline constexpr std::string_view kEventTrigger = "kEventTrigger";
inline constexpr std::string_view kEventMetric = "kEventMetric";

// Commands.
inline constexpr std::string_view kCommandAddConfiguration = "kCommandAddConfiguration";
inline constexpr std::string_view kCommandClearConfiguration = "kCommandClearConfiguration";
inline constexpr std::string_view kCommandQueryMetric = "kCommandQueryMetric";

// Keys of requests and events.
inline constexpr std::string_view kKeyAppID = "kKeyAppID";
inline constexpr std::string_view kKeyPayload = "kKeyPayload";
inline constexpr std::string_view kKeyPayloadType = "kKeyPayloadType";
inline constexpr std::string_view kKeyTriggerRef = "kKeyTriggerRef";
inline constexpr std::string_view kKeyTriggerType = "kKeyTriggerType";
inline constexpr std::string_view kKeyTriggerID = "kKeyTriggerID";
inline constexpr std::string_view kKeyProfileID = "kKeyProfileID";
inline constexpr std::string_view kKeyMetricID = "kKeyMetricID";

// A query's trigger identifier is this plus the 16-bit identifier of the metric asked for.
inline constexpr std::int64_t kQueryTriggerBase = 0x7F0000;

}  // namespace tesk
