#include "capture/RecordConnection.h"

#include <algorithm>
#include <utility>

#include "tesk/Constants.h"
#include "tesk/bus/ServiceStatus.h"

namespace qel::capture {
namespace {

constexpr std::int64_t kPayloadType = 0;
constexpr std::int64_t kTriggerRef = 9999;
constexpr std::int64_t kSimFilesMetric = 19;

}  // namespace

RecordConnection::RecordConnection(tesk::Connector& connector, RecorderIdentity identity,
                                   std::optional<std::string> bus, Bytes configuration,
                                   tesk::EventSink sink)
    : _identity(std::move(identity)),
      _bus(std::move(bus)),
      _configuration(std::move(configuration)),
      _transport(connector.connect(_identity.name, std::move(sink))) {}

RecordConnection::~RecordConnection() { end(); }

std::uint64_t RecordConnection::end() {
  if (!_transport || std::exchange(_ended, true)) return 0;
  _transport->eventsOff();
  if (!_bus) {
    clear();
    return 0;
  }
  std::string why;
  const auto status = tesk::bus::readServiceStatus({*_bus}, why);
  if (!status) return 0;
  const auto isRecorder = [this](const auto& client) { return client.name == _identity.name; };
  if (std::ranges::count_if(status->clients, isRecorder) > 1) return 0;
  clear();
  const auto own = std::ranges::find_if(status->clients, isRecorder);
  return own == status->clients.end() ? 0 : own->dropped;
}

void RecordConnection::clear() {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, _identity.application);
  tesk::Message reply;
  _transport->performCommand(tesk::kCommandClearConfiguration, request, reply);
}

tesk::CommandResult RecordConnection::install() {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, _identity.application);
  request.setData(tesk::kKeyPayload, _configuration);
  request.setInt64(tesk::kKeyPayloadType, kPayloadType);
  tesk::Message reply;
  return _transport->performCommand(tesk::kCommandAddConfiguration, request, reply);
}

// They are not sent unless somebody asks. A modem without a SIM refuses, and that is no error.
void RecordConnection::querySimFiles() {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, _identity.application);
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
  if (!_transport) return {tesk::kServiceUnreachable, "there is no way to the service"};
  auto result = install();
  if (result.code != 0) return result;
  _transport->eventsOn();
  querySimFiles();
  return result;
}

}  // namespace qel::capture
