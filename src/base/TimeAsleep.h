// How long the machine has been suspended.
#pragma once

#include <chrono>

namespace qel {

// Since it was started; any thread. Steady clocks and their timers stand still meanwhile.
std::chrono::milliseconds timeAsleep();

}  // namespace qel
