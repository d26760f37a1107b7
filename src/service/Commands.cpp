// The commands of the service.
#include <utility>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/catalogue/TagLog.h"
#include "service/Request.h"
#include "service/ServiceCore.h"
#include "tesk/Constants.h"

namespace qel::service {
namespace {

// The metric that a query's trigger stands for, or nothing.
std::optional<std::uint32_t> queriedMetric(std::int64_t trigger) {
  for (const MetricName& metric : KBBMetricUtility::catalogue()) {
    if (tesk::kQueryTriggerBase + std::int64_t{metric.identifier} == trigger) {
      return metric.identifier;
    }
  }
  return std::nullopt;
}

// 0 leaves it to the trigger; a metric's own identifier, in either form, must say the same.
bool agrees(std::int64_t metricID, std::uint32_t metric) {
  return metricID == 0 || metricID == std::int64_t{metric} ||
         metricID == std::int64_t{metric} + std::int64_t{kMetricEventBase};
}

}  // namespace

const std::array<ServiceCore::Command, 3> ServiceCore::kCommands = {{
    {tesk::kCommandAddConfiguration, &ServiceCore::addConfiguration},
    {tesk::kCommandClearConfiguration, &ServiceCore::clearConfiguration},
    {tesk::kCommandQueryMetric, &ServiceCore::queryMetric},
}};

tesk::CommandResult ServiceCore::performCommand(Session& session, std::string_view command,
                                                const tesk::Message& request) {
  ++_commands;
  tesk::CommandResult result = refusal(CommandCode::unknownCommand, "unknown command");
  for (const Command& row : kCommands) {
    if (row.name == command) result = (this->*row.handler)(session, request.entries());
  }
  if (result.code != 0) ++_refusedCommands;
  return result;
}

void ServiceCore::join(Session& session, std::int64_t application) {
  session.setApplication(application);
  _listeners->changed();
}

tesk::CommandResult ServiceCore::addConfiguration(Session& session, const Dictionary& entries) {
  Request request(entries);
  const std::int64_t application = request.integer(tesk::kKeyAppID);
  const Bytes* payload = request.bytes(tesk::kKeyPayload);
  request.payloadType();
  if (request.refused()) return *request.refused();
  std::string reason;
  CommandCode code{};
  const CountedTagLines lines;
  auto configuration = DeviceConfiguration::fromPayload(*payload, reason, code);
  noteTagLines(lines.count());
  if (!configuration) return refusal(code, "kKeyPayload " + reason);
  const auto refused =
      _book.install(session.clientName(), application, *payload, std::move(*configuration));
  if (refused) return *refused;
  join(session, application);
  return {};
}

tesk::CommandResult ServiceCore::clearConfiguration(Session& session, const Dictionary& entries) {
  Request request(entries);
  const std::int64_t application = request.integer(tesk::kKeyAppID);
  if (request.refused()) return *request.refused();
  _book.clear(session.clientName(), application);
  join(session, application);
  return {};
}

tesk::CommandResult ServiceCore::queryMetric(Session& session, const Dictionary& entries) {
  Request request(entries);
  const std::int64_t application = request.integer(tesk::kKeyAppID);
  request.payloadType();
  const std::int64_t triggerRef = request.integer(tesk::kKeyTriggerRef);
  request.integer(tesk::kKeyTriggerType);
  const std::int64_t trigger = request.integer(tesk::kKeyTriggerID);
  const std::int64_t profile = request.integer(tesk::kKeyProfileID);
  const std::int64_t metricID = request.integer(tesk::kKeyMetricID);
  if (request.refused()) return *request.refused();
  const auto metric = queriedMetric(trigger);
  if (!metric) {
    return refusal(CommandCode::unknownMetric,
                   "kKeyTriggerID " + std::to_string(trigger) + " asks for no known metric");
  }
  if (!agrees(metricID, *metric)) {
    return refusal(CommandCode::unknownMetric, "kKeyMetricID " + std::to_string(metricID) +
                                                   " is not the metric of kKeyTriggerID " +
                                                   std::to_string(trigger));
  }
  _book.note(session.clientName(), application);
  if (session.application() != application) join(session, application);
  sources::SourceAnswer answer = _source->query(*metric);
  if (!answer.known) return refusal(CommandCode::metricNotAvailable, std::move(answer.message));
  sources::SourceEvent event{answer.timeMs, tesk::kEventMetric, std::move(answer.entries)};
  event.entries.set(tesk::kKeyProfileID, profile);
  event.entries.set(tesk::kKeyTriggerRef, triggerRef);
  event.entries.set(tesk::kKeyTriggerID, trigger);
  EventFault fault;
  if (!examine(event, fault)) {
    _undecodableLog.note(fault.reason);
    return refusal(CommandCode::metricNotAvailable, std::move(fault.reason));
  }
  if (!session.answer(event)) {
    return refusal(CommandCode::deliveryOff, "events are off: the metric cannot be delivered");
  }
  ++_delivered;
  return {};
}

}  // namespace qel::service
