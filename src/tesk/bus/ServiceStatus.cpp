#include "tesk/bus/ServiceStatus.h"

#include <sdbus-c++/sdbus-c++.h>
#include <chrono>
#include <memory>
#include <tuple>

#include "tesk/bus/BasebandManager1Proxy.h"
#include "tesk/bus/Reasons.h"

namespace tesk::bus {
namespace {

using namespace std::chrono_literals;

constexpr auto kCallTimeout = 5s;

using Properties = std::map<std::string, sdbus::Variant>;
using ClientProperty = sdbus::Struct<std::string, bool, std::uint64_t, std::uint64_t>;

class StatusProxy final : public sdbus::ProxyInterfaces<sdbus::Properties_proxy> {
 public:
  explicit StatusProxy(sdbus::IConnection& connection)
      : ProxyInterfaces(connection, kServiceName, kObjectPath) {
    registerProxy();
  }
  ~StatusProxy() { unregisterProxy(); }

 private:
  void onPropertiesChanged(const std::string&, const Properties&,
                           const std::vector<std::string>&) override {}
};

// A service of another version may lack a property: the value is then left as it is.
template <class Held>
void take(const Properties& properties, const char* name, Held& value) {
  const auto found = properties.find(name);
  if (found != properties.end() && found->second.containsValueOfType<Held>()) {
    value = found->second.get<Held>();
  }
}

std::vector<FactStatus> factsOf(const Properties& properties) {
  std::vector<sdbus::Struct<std::string, std::string>> rows;
  take(properties, "SourceFacts", rows);
  std::vector<FactStatus> facts;
  for (const auto& row : rows) facts.push_back({std::get<0>(row), std::get<1>(row)});
  return facts;
}

ConditionStatus conditionOf(const Properties& entries) {
  ConditionStatus condition;
  take(entries, "state", condition.state);
  take(entries, "text", condition.text);
  take(entries, "reason", condition.reason);
  take(entries, "model", condition.model);
  take(entries, "driver", condition.driver);
  return condition;
}

ServiceStatus statusOf(const Properties& properties) {
  ServiceStatus status;
  take(properties, "Version", status.version);
  take(properties, "Source", status.source);
  take(properties, "SourceRunning", status.sourceRunning);
  Properties condition;
  take(properties, "Condition", condition);
  status.condition = conditionOf(condition);
  status.facts = factsOf(properties);
  take(properties, "Configurations", status.configurations);
  std::vector<ClientProperty> clients;
  take(properties, "Clients", clients);
  for (const ClientProperty& client : clients) {
    status.clients.push_back(
        {std::get<0>(client), std::get<1>(client), std::get<2>(client), std::get<3>(client)});
  }
  take(properties, "EventsReceived", status.eventsReceived);
  take(properties, "EventsDelivered", status.eventsDelivered);
  take(properties, "EventsDropped", status.eventsDropped);
  take(properties, "EventsUndecodable", status.eventsUndecodable);
  take(properties, "EventsWithoutContent", status.eventsWithoutContent);
  return status;
}

std::string wordsFor(const sdbus::Error& error) {
  if (error.getName() == "org.freedesktop.DBus.Error.AccessDenied") {
    return "no permission to use it (is the user in group baseband?)";
  }
  const auto reason = reasonOf(error);
  return std::string(reason.substr(reason.starts_with(kTheService) ? kTheService.size() : 0));
}

}  // namespace

std::optional<ServiceStatus> readServiceStatus(const BusAddress& address, std::string& why) {
  std::unique_ptr<sdbus::IConnection> connection;
  try {
    connection = connectTo(address);
  } catch (const sdbus::Error&) {
    why = "no message bus";
    return std::nullopt;
  }
  try {
    connection->setMethodCallTimeout(kCallTimeout);
    StatusProxy proxy(*connection);
    return statusOf(proxy.GetAll(tesk::BasebandManager1_proxy::INTERFACE_NAME));
  } catch (const sdbus::Error& error) {
    why = wordsFor(error);
    return std::nullopt;
  }
}

}  // namespace tesk::bus
