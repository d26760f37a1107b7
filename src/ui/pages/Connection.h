// What the newest reports say of the phone's connection.
#pragma once

#include <optional>
#include <string>

#include "metrics/MetricStore.h"
#include "radio/Technology.h"

namespace qel {

// "idle", "connecting", "connected", "CELL_DCH", "dedicated"; empty: not known.
std::string connectionWord(const MetricStore& store, Technology technology);

// The primary carrier and the secondary ones that are configured; nothing when no report told.
std::optional<unsigned> carrierCount(const MetricStore& store, Technology technology);

// The serving cell's band as reported, when that report is of this channel: "20", "VIII",
// "DCS 1800"; empty: it is not, or names none.
std::string reportedBand(const MetricStore& store, Technology technology, std::uint32_t channel);

}  // namespace qel
