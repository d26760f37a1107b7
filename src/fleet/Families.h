// Families of numbers in the library's form.
#pragma once

#include <prometheus/metric_family.h>

#include <string>
#include <utility>

namespace qel::fleet {

inline prometheus::ClientMetric oneNumber(prometheus::MetricType type, double value) {
  prometheus::ClientMetric metric;
  (type == prometheus::MetricType::Counter ? metric.counter.value : metric.gauge.value) = value;
  return metric;
}

inline prometheus::MetricFamily oneFamily(std::string name, std::string help,
                                          prometheus::MetricType type, double value) {
  return {std::move(name), std::move(help), type, {oneNumber(type, value)}};
}

}  // namespace qel::fleet
