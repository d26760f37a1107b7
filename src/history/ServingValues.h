// The levels and qualities of the serving cell in a report.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>

#include "base/Value.h"
#include "history/Quantity.h"

namespace qel {

// By quantity; of several receivers the better one (36.214, clause 5.1.1). A value that the
// quantity cannot have is none.
using ServingValues = std::array<std::optional<float>, kQuantities.size()>;

// Whether reports of the metric carry any.
bool hasServingValues(std::int64_t metric);

// `record` as the dispatcher stores it, or as it comes out of the codec.
ServingValues servingValues(std::int64_t metric, const Dictionary& record);

// Whether a report may say so.
bool isPossible(Quantity quantity, float value);

}  // namespace qel
