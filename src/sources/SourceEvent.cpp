#include "sources/SourceEvent.h"

#include <utility>

#include "messages/catalogue/MetricNumber.h"

namespace qel::sources {

SourceEvent metricEvent(std::uint32_t metric, Bytes payload, std::uint64_t timeMs) {
  return {timeMs,
          tesk::kEventMetric,
          {{tesk::kKeyMetricID, std::int64_t{metric} + std::int64_t{kMetricEventBase}},
           {tesk::kKeyProfileID, std::int64_t{0}},
           {tesk::kKeyPayload, std::move(payload)}}};
}

std::optional<std::uint32_t> metricOf(const SourceEvent& event) {
  if (event.stream != tesk::kEventMetric) return std::nullopt;
  const Value* value = event.entries.find(tesk::kKeyMetricID);
  const auto identifier = value ? value->asInt64() : std::nullopt;
  return identifier ? metricOfNumber(*identifier) : std::nullopt;
}

}  // namespace qel::sources
