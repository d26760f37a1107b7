// Who follows the dispatcher.
#pragma once

#include <cstdint>

#include "base/Value.h"
#include "metrics/DispatchTable.h"

namespace qel {

// One metric that the dispatcher has stored; valid during the call only.
struct StoredMetric {
  const DispatchRow& row;
  const Dictionary& record;  // as it stands in its slot, after the last derivation
  ByteView payload;          // as it came
  std::uint64_t receivedMs;  // since 1970-01-01 00:00 UTC
};

// One that no handler takes; valid during the call only.
struct PassedMetric {
  std::int64_t identifier;  // as events carry it
  ByteView payload;         // never looked at
  std::uint64_t receivedMs;
};

// Main thread.
class MetricObserver {
 public:
  virtual ~MetricObserver() = default;
  // After the dispatcher's last step. The store must stay as it is.
  virtual void metricWasStored(const StoredMetric& metric) = 0;
  virtual void metricWasPassedOver(const PassedMetric& /*metric*/) {}
};

}  // namespace qel
