// What an event is called outside.
#pragma once

#include <string>

#include "recording/RecordedEvent.h"

namespace qel::fleet {

// The metric's name in the catalogue, or its number there or in events; of a trigger "trigger".
std::string metricNameOf(const RecordedEvent& event);

}  // namespace qel::fleet
