// The road of the simulated drive, and where the car is when.
#pragma once

#include <cstdint>

namespace qel::sources {

// The road runs along x from 0 to kRoadM: a town, a ridge, open country, a second ridge, a valley,
// a third ridge, and a second town. At its end the car turns, and so on without end.
inline constexpr double kRoadM = 9900;

// Metres along the road, so long after the start.
double carPositionM(std::uint64_t elapsedMs);

// What the ridges between the car and a mast keep back, in dB.
double ridgeLossDb(double carM, double mastM);

// What the underpass in the first town keeps back from every mast, in dB.
double underpassLossDb(double carM);

// True near the underpass, where the navigation looks for its way again.
bool nearUnderpass(double carM);

}  // namespace qel::sources
