#include "sources/SourceEvent.h"

#include <utility>

#include "messages/catalogue/KBBMetricUtility.h"

namespace qel::sources {

SourceEvent metricEvent(std::uint32_t metric, Bytes payload, std::uint64_t timeMs) {
  return {timeMs,
          tesk::kEventMetric,
          {{tesk::kKeyMetricID, std::int64_t{metric} + std::int64_t{kMetricEventBase}},
           {tesk::kKeyProfileID, std::int64_t{0}},
           {tesk::kKeyPayload, std::move(payload)}}};
}

}  // namespace qel::sources
