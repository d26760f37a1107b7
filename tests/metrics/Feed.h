// Feeds encoded metrics to a dispatcher, as the wrapper would.
#pragma once

#include "base/Value.h"
#include "messages/runtime/PBCodable.h"
#include "metrics/MetricValidator.h"
#include "support/FixedTimeZone.h"
#include "support/RecordingSink.h"

namespace qel::testing {

inline Dictionary metricEvent(std::int64_t identifier, Bytes payload) {
  return {{"kKeyMetricID", identifier}, {"kKeyProfileID", 0}, {"kKeyPayload", std::move(payload)}};
}

inline Dictionary metricEvent(std::int64_t identifier, const PBCodable& message) {
  return metricEvent(identifier, message.data());
}

// A dispatcher without a service, in UTC, whose lines are kept.
struct FedValidator {
  void feed(std::int64_t identifier, const PBCodable& message) {
    validator->metricsDidUpdate(metricEvent(identifier, message));
  }
  MetricValidator* operator->() const { return validator.get(); }

  CapturedStandardOutput out;
  CapturedSystemLog log;
  FixedTimeZone utc{0, "UTC"};
  std::shared_ptr<MetricValidator> validator = MetricValidator::create(nullptr, utc);
};

}  // namespace qel::testing
