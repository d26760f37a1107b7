// Metrics that no handler of the dispatcher takes and that the history makes something of.
#pragma once

#include <cstdint>

#include "metrics/DispatchTable.h"
#include "metrics/MetricValidator.h"

namespace qel {

inline constexpr std::int64_t kLteServingMeasurement = MetricValidator::K_LTE_SCELL_MEAS;
inline constexpr std::int64_t kLteLinkFailure = MetricValidator::K_LTE_RLF;

// For the journal, as of one that is dispatched; it has no slot.
const DispatchRow& lteServingMeasurementRow();

}  // namespace qel
