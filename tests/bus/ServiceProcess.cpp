#include "bus/ServiceProcess.h"

#include <chrono>

#include "messages/device_config.h"
#include "tesk/Constants.h"

namespace qel::testing {
namespace {

using Words = std::vector<std::string>;

Words wordsOf(const PrivateBus& bus, const std::string& source, const Words& state) {
  Words words{QEL_BASEBANDD, "--bus", bus.address(), "--source", source};
  words.insert(words.end(), state.begin(), state.end());
  return words;
}

}  // namespace

ServiceProcess::ServiceProcess(const PrivateBus& bus, const std::string& source, State state)
    : ChildProcess(
          {.words = wordsOf(bus, source, state == State::none ? Words{"--no-state"} : Words{})}) {}

ServiceProcess::ServiceProcess(const PrivateBus& bus, const std::string& source,
                               const std::string& stateDirectory)
    : ChildProcess({.words = wordsOf(bus, source, {"--state", stateDirectory})}) {}

Client::Client(const PrivateBus& bus, const std::string& name) {
  const auto connector =
      tesk::bus::makeBusConnector({bus.address()}, [this](bool reachable, const std::string& why) {
        const std::lock_guard lock(_mutex);
        _reachable = reachable;
        _why = why;
        _changed.notify_all();
      });
  _transport =
      connector->connect(name, [this](std::string_view eventName, const tesk::Message& event) {
        if (eventName != tesk::kEventMetric) return;
        const std::lock_guard lock(_mutex);
        _metrics.push_back(event.entries().find(tesk::kKeyMetricID)->asInt64().value());
        _changed.notify_all();
      });
}

template <class Condition>
bool Client::waitFor(Condition condition) {
  std::unique_lock lock(_mutex);
  return _changed.wait_for(lock, std::chrono::seconds(60), condition);
}

bool Client::waitForReachable(bool reachable) {
  return waitFor([this, reachable] { return _reachable == reachable; });
}

bool Client::waitForMetrics(std::size_t count) {
  return waitFor([this, count] { return _metrics.size() >= count; });
}

tesk::CommandResult Client::install(std::int64_t application,
                                    const std::vector<std::uint32_t>& metrics) {
  DeviceConfig configuration;
  configuration.setFormat(1);
  for (const std::uint32_t metric : metrics) {
    auto wanted = std::make_shared<ConfiguredMetric>();
    wanted->setIdentifier(metric);
    configuration.addMetric(std::move(wanted));
  }
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, application);
  request.setData(tesk::kKeyPayload, configuration.data());
  request.setInt64(tesk::kKeyPayloadType, 0);
  tesk::Message reply;
  return _transport->performCommand(tesk::kCommandAddConfiguration, request, reply);
}

tesk::CommandResult Client::clear(std::int64_t application) {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, application);
  tesk::Message reply;
  return _transport->performCommand(tesk::kCommandClearConfiguration, request, reply);
}

tesk::CommandResult Client::query(std::int64_t application, std::int64_t trigger) {
  tesk::Message request;
  request.setInt64(tesk::kKeyAppID, application);
  request.setInt64(tesk::kKeyPayloadType, 0);
  request.setInt64(tesk::kKeyTriggerRef, 9999);
  request.setInt64(tesk::kKeyTriggerType, 0);
  request.setInt64(tesk::kKeyTriggerID, trigger);
  request.setInt64(tesk::kKeyProfileID, 0);
  request.setInt64(tesk::kKeyMetricID, 0);
  tesk::Message reply;
  return _transport->performCommand(tesk::kCommandQueryMetric, request, reply);
}

std::vector<std::int64_t> Client::metrics() const {
  const std::lock_guard lock(_mutex);
  return _metrics;
}

void Client::forgetMetrics() {
  const std::lock_guard lock(_mutex);
  _metrics.clear();
}

std::string Client::why() const {
  const std::lock_guard lock(_mutex);
  return _why;
}

}  // namespace qel::testing
