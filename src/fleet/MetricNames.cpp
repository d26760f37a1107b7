#include "fleet/MetricNames.h"

#include <algorithm>

#include "messages/catalogue/MetricNumber.h"

namespace qel::fleet {

std::string metricNameOf(const RecordedEvent& event) {
  if (event.kind == RecordedKind::trigger) return "trigger";
  const Value* value = event.entries.find(kRecordedMetricKey);
  const std::int64_t number = value ? value->asInt64().value_or(0) : 0;
  const auto metric = metricOfNumber(number);
  if (!metric) return std::to_string(number);
  const auto catalogue = KBBMetricUtility::catalogue();
  const auto known = std::ranges::find(catalogue, *metric, &MetricName::identifier);
  return known == catalogue.end() ? std::to_string(*metric) : std::string(known->name);
}

}  // namespace qel::fleet
