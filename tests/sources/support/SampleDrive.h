// The drive of the recording that is kept beside the tests.
#pragma once

#include <vector>

#include "recording/RecordedEvent.h"

namespace qel::testing {

// Ten minutes of it.
std::vector<RecordedEvent> sampleDrive();

}  // namespace qel::testing
