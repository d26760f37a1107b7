// An event as its record, for receivers that know nothing of the codec.
#pragma once

#include <optional>
#include <string>

#include "recording/RecordedEvent.h"

namespace qel::fleet {

// {"time_ms": …, "event": "metric", "metric": NAME, "record": {…}, "units": {…}}: the message's
// dictionary with its values in the units that the tables show, and beside it, key for key, the
// units of those fields that have one. An event without a message class has "entries", its own.
// Nothing when the payload cannot be decoded. Any thread.
std::optional<std::string> decodedLine(const RecordedEvent& event);

}  // namespace qel::fleet
