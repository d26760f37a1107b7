#include "service/ServiceEvent.h"

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/MetricMessages.h"
#include "tesk/Constants.h"

namespace qel::service {
namespace {

constexpr std::int64_t kLargestMetric = 0xFFFF;

std::optional<std::int64_t> integerUnder(std::string_view key, const Dictionary& entries,
                                         std::string& reason) {
  const Value* value = entries.find(key);
  const auto number = value ? value->asInt64() : std::nullopt;
  if (!number) reason = std::string(key) + " is missing or no integer";
  return number;
}

std::optional<EventSubject> examineMetric(const Dictionary& entries, std::string& reason) {
  const auto identifier = integerUnder(tesk::kKeyMetricID, entries, reason);
  if (!identifier) return std::nullopt;
  const std::int64_t metric = *identifier - std::int64_t{kMetricEventBase};
  if (metric < 0 || metric > kLargestMetric) {
    reason = "kKeyMetricID " + std::to_string(*identifier) + " is no metric's";
    return std::nullopt;
  }
  const Value* value = entries.find(tesk::kKeyPayload);
  const Bytes* payload = value ? value->asBytes() : nullptr;
  if (!payload) {
    reason = "metric " + std::to_string(metric) + " without payload";
    return std::nullopt;
  }
  const MetricMessage* message = findMetricMessage(static_cast<std::uint32_t>(metric));
  if (message && !message->decode(*payload)) {
    reason = "undecodable payload of metric " + std::to_string(metric) + " (" +
             std::string(message->className) + ")";
    return std::nullopt;
  }
  return EventSubject{true, metric};
}

}  // namespace

std::optional<EventSubject> examineEvent(const ServiceEvent& event, std::string& reason) {
  if (event.stream == tesk::kEventMetric) return examineMetric(event.entries, reason);
  const auto trigger = integerUnder(tesk::kKeyTriggerID, event.entries, reason);
  if (!trigger) return std::nullopt;
  return EventSubject{false, *trigger};
}

}  // namespace qel::service
