// The names that the baseband manager and its clients share. Each one's text is its own name.
#pragma once

#include <cstdint>
#include <string_view>

#include "messages/catalogue/EventNames.h"

namespace tesk {

// Commands.
inline constexpr std::string_view kCommandAddConfiguration = "kCommandAddConfiguration";
inline constexpr std::string_view kCommandClearConfiguration = "kCommandClearConfiguration";
inline constexpr std::string_view kCommandQueryMetric = "kCommandQueryMetric";

// Keys of requests, besides those of events.
inline constexpr std::string_view kKeyAppID = "kKeyAppID";
inline constexpr std::string_view kKeyPayloadType = "kKeyPayloadType";
inline constexpr std::string_view kKeyTriggerRef = "kKeyTriggerRef";
inline constexpr std::string_view kKeyTriggerType = "kKeyTriggerType";

// A query's trigger identifier is this plus the 16-bit identifier of the metric asked for.
inline constexpr std::int64_t kQueryTriggerBase = 0x7F0000;

}  // namespace tesk
