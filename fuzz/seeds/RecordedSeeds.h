// Seeds from the events of a recording.
#pragma once

#include <string>
#include <vector>

#include "recording/RecordedEvent.h"

namespace qel::fuzz {

// The first two events of every metric. A recording that cannot be read is a fatal error.
std::vector<RecordedEvent> firstOfEach(const std::string& recording);

// As the targets read them.
std::vector<Bytes> eventSeeds(const std::vector<RecordedEvent>& events);
std::vector<Bytes> lineSeeds(const std::vector<RecordedEvent>& events);
std::vector<Bytes> recordingSeeds(const std::vector<RecordedEvent>& events);
std::vector<Bytes> identitySeeds(const std::vector<RecordedEvent>& events);
std::vector<Bytes> packetSeeds(const std::vector<RecordedEvent>& events);

}  // namespace qel::fuzz
