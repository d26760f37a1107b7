// The cell that a serving-cell report names.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "base/Value.h"
#include "history/Cell.h"

namespace qel {

// `record` as the dispatcher stores it. Nothing when the metric is none of the serving cell, or its
// report names neither channel nor code nor identity.
std::optional<Cell> reportedCell(std::int64_t metric, const Dictionary& record);

// "LTE PCI 217, EARFCN 38098, cell 17955330": what is known of it.
std::string textOf(const Cell& cell);

}  // namespace qel
