// Configurations, and the requests of clients.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <memory>
#include <utility>

#include "messages/device_config.h"
#include "tesk/Constants.h"
#include "tesk/Message.h"

namespace qel::testing {

struct MetricWish {
  std::uint32_t metric;
  std::uint32_t periodMs = 0;
};

inline Bytes configuration(
    std::initializer_list<MetricWish> metrics,
    std::initializer_list<std::pair<std::uint32_t, std::uint32_t>> triggers = {}) {
  DeviceConfig message;
  message.setFormat(1);
  for (const MetricWish& wish : metrics) {
    auto metric = std::make_shared<ConfiguredMetric>();
    metric->setIdentifier(wish.metric);
    if (wish.periodMs != 0) metric->setPeriodMs(wish.periodMs);
    message.addMetric(metric);
  }
  for (const auto& [first, last] : triggers) {
    auto trigger = std::make_shared<ConfiguredTrigger>();
    trigger->setFirst(first);
    trigger->setLast(last);
    message.addTrigger(trigger);
  }
  return message.data();
}

// So many, all alike.
inline Bytes triggers(std::size_t count, std::uint32_t first = 1) {
  DeviceConfig message;
  message.setFormat(1);
  for (std::size_t i = 0; i < count; ++i) {
    auto trigger = std::make_shared<ConfiguredTrigger>();
    trigger->setFirst(first);
    message.addTrigger(trigger);
  }
  return message.data();
}

inline tesk::Message addRequest(Bytes payload, std::int64_t application = 2) {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, application);
  request.setData(tesk::kKeyPayload, std::move(payload));
  request.setInt64(tesk::kKeyPayloadType, 0);
  return request;
}

inline tesk::Message clearRequest(std::int64_t application = 2) {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, application);
  return request;
}

inline tesk::Message queryRequest(std::int64_t trigger, std::int64_t metric = 0) {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, 2);
  request.setInt64(tesk::kKeyPayloadType, 0);
  request.setInt64(tesk::kKeyTriggerRef, 9999);
  request.setInt64(tesk::kKeyTriggerType, 0);
  request.setInt64(tesk::kKeyTriggerID, trigger);
  request.setInt64(tesk::kKeyProfileID, 0);
  request.setInt64(tesk::kKeyMetricID, metric);
  return request;
}

}  // namespace qel::testing
