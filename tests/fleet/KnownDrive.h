// An hour of a phone of which everything is known, as its exporter tells it.
#pragma once

#include <cstdint>
#include <string>

namespace qel::testing {

inline constexpr std::int64_t kDriveStartS = 1'763'632'800;  // 2025-11-20 10:00 UTC
inline constexpr const char* kDrivenPhone = "phone:9817";

// Asked every fifteen seconds, from one second after its start: OpenMetrics with the time and the
// labels of who was asked in each line. Minutes 0 to 20 on the LTE cell of PCI 217, a handover to
// 218, from 30 a reselection to 219, from 40 on UMTS and from 50 on GSM; one reject; 240 events
// that clients did not read and 480 that nobody could decode.
std::string knownDrive();

}  // namespace qel::testing
