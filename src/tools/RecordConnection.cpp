#include "tools/RecordConnection.h"

#include <algorithm>
#include <utility>

#include "tesk/Constants.h"
#include "tesk/bus/ServiceStatus.h"

namespace qel::tools {
namespace {

constexpr const char* kClientName = "qelctl-record";
// The viewer's is 2.
constexpr std::int64_t kApplication = 3;
constexpr std::int64_t kPayloadType = 0;
constexpr std::int64_t kTriggerRef = 9999;
constexpr std::int64_t kSimFilesMetric = 19;

}  // namespace

RecordConnection::RecordConnection(std::string bus, Bytes configuration, tesk::EventSink sink,
                                   tesk::bus::ReachabilityObserver observer,
                                   tesk::bus::AnswerWaitMaker makeWait)
    : _bus(std::move(bus)),
      _configuration(std::move(configuration)),
      _transport(tesk::bus::makeBusConnector({_bus}, std::move(observer), std::move(makeWait))
                     ->connect(kClientName, std::move(sink))) {}

RecordConnection::~RecordConnection() { end(); }

std::uint64_t RecordConnection::end() {
  if (std::exchange(_ended, true)) return 0;
  _transport->eventsOff();
  std::string why;
  const auto status = tesk::bus::readServiceStatus({_bus}, why);
  if (!status) return 0;
  const auto isRecorder = [](const auto& client) { return client.name == kClientName; };
  if (std::ranges::count_if(status->clients, isRecorder) > 1) return 0;
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, kApplication);
  tesk::Message reply;
  _transport->performCommand(tesk::kCommandClearConfiguration, request, reply);
  const auto own = std::ranges::find_if(status->clients, isRecorder);
  return own == status->clients.end() ? 0 : own->dropped;
}

tesk::CommandResult RecordConnection::install() {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, kApplication);
  request.setData(tesk::kKeyPayload, _configuration);
  request.setInt64(tesk::kKeyPayloadType, kPayloadType);
  tesk::Message reply;
  return _transport->performCommand(tesk::kCommandAddConfiguration, request, reply);
}

// They are not sent unless somebody asks. A modem without a SIM refuses, and that is no error.
void RecordConnection::querySimFiles() {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, kApplication);
  request.setInt64(tesk::kKeyPayloadType, kPayloadType);
  request.setInt64(tesk::kKeyTriggerRef, kTriggerRef);
  request.setInt64(tesk::kKeyTriggerType, 0);
  request.setInt64(tesk::kKeyTriggerID, tesk::kQueryTriggerBase + kSimFilesMetric);
  request.setInt64(tesk::kKeyProfileID, 0);
  request.setInt64(tesk::kKeyMetricID, 0);
  tesk::Message reply;
  _transport->performCommand(tesk::kCommandQueryMetric, request, reply);
}

tesk::CommandResult RecordConnection::begin() {
  auto result = install();
  if (result.code != 0) return result;
  _transport->eventsOn();
  querySimFiles();
  return result;
}

}  // namespace qel::tools
