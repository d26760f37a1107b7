// LTE downlink bandwidth codes.
#pragma once

#include <cstdint>
#include <map>

namespace qel {

// Code of the messages → MHz (the six bandwidths of 3GPP TS 36.101, table 5.6-1, in order).
using BandwidthTable = std::map<std::int32_t, float>;

BandwidthTable makeBandwidthTable();

}  // namespace qel
