// How long the machine has been suspended.
#pragma once

#include <chrono>

namespace qel {

// Since it was started; any thread. Steady clocks and their timers stand still meanwhile.
std::chrono::milliseconds timeAsleep();

// Now, on a steady clock that goes on meanwhile.
std::chrono::steady_clock::time_point sleeplessNow();

}  // namespace qel
