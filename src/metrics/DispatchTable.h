// Which handler takes which metric, as data.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

#include "messages/catalogue/MetricMessages.h"
#include "metrics/Derivations.h"
#include "metrics/MetricStore.h"

namespace qel {

// One handled metric.
struct DispatchRow {
  std::int64_t identifier;   // as events carry it
  DescribePayload describe;  // by the metric's message class
  MetricStore::Slot MetricStore::*slot;
  std::string_view logText;  // the record follows at once
  Derivation derivation;
};

// All 29.
std::span<const DispatchRow> dispatchTable();

// The row of the identifier, or nothing when no handler takes it.
const DispatchRow* findDispatchRow(std::int64_t identifier);

}  // namespace qel
