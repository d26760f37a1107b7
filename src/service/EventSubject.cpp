#include "service/EventSubject.h"

#include "messages/catalogue/MetricMessages.h"
#include "messages/catalogue/MetricNumber.h"
#include "service/ReportContent.h"
#include "tesk/Constants.h"

namespace qel::service {
namespace {

std::optional<std::int64_t> integerUnder(std::string_view key, const Dictionary& entries,
                                         std::string& reason) {
  const Value* value = entries.find(key);
  const auto number = value ? value->asInt64() : std::nullopt;
  if (!number) reason = std::string(key) + " is missing or no integer";
  return number;
}

bool examinePayload(const MetricMessage& message, const Dictionary& entries, EventFault& fault) {
  const Value* value = entries.find(tesk::kKeyPayload);
  const Bytes* payload = value ? value->asBytes() : nullptr;
  const auto metric = [&] {
    return "metric " + std::to_string(message.identifier) + " (" + std::string(message.className) +
           ")";
  };
  if (value && !payload) {
    fault.reason = "the payload of " + metric() + " is no bytes";
    return false;
  }
  switch (reportContent(message, payload ? ByteView(*payload) : ByteView())) {
    case ReportContent::drawable:
      return true;
    case ReportContent::missing:
      fault = {true, "nothing to show in " + metric()};
      return false;
    case ReportContent::undecodable:
      fault.reason = "undecodable payload of " + metric();
      return false;
  }
  return false;
}

std::optional<EventSubject> examineMetric(const Dictionary& entries, EventFault& fault) {
  const auto identifier = integerUnder(tesk::kKeyMetricID, entries, fault.reason);
  if (!identifier) return std::nullopt;
  const auto metric = metricOfNumber(*identifier);
  if (!metric) {
    fault.reason = "kKeyMetricID " + std::to_string(*identifier) + " is no metric's";
    return std::nullopt;
  }
  const MetricMessage* message = findMetricMessage(*metric);
  if (message && !examinePayload(*message, entries, fault)) return std::nullopt;
  return EventSubject{true, *metric};
}

}  // namespace

std::optional<EventSubject> examineEvent(const sources::SourceEvent& event, EventFault& fault) {
  if (event.stream == tesk::kEventMetric) return examineMetric(event.entries, fault);
  const auto trigger = integerUnder(tesk::kKeyTriggerID, event.entries, fault.reason);
  if (!trigger) return std::nullopt;
  return EventSubject{false, *trigger};
}

}  // namespace qel::service
