#include "fleet/ServiceCounts.h"

#include <cstdint>
#include <utility>

#include "fleet/Families.h"

namespace qel::fleet {

using prometheus::MetricFamily;
using prometheus::MetricType;

std::vector<MetricFamily> serviceFamilies(const std::optional<tesk::bus::ServiceStatus>& status) {
  std::vector<MetricFamily> told = {oneFamily("qelwatch_service_up",
                                              "Whether the baseband manager service answers.",
                                              MetricType::Gauge, status ? 1 : 0)};
  if (!status) return told;
  told.push_back(oneFamily("qelwatch_source_running", "Whether the service's source runs.",
                           MetricType::Gauge, status->sourceRunning ? 1 : 0));
  const auto count = [&told](const char* name, const char* help, std::uint64_t value) {
    told.push_back(oneFamily(name, help, MetricType::Counter, static_cast<double>(value)));
  };
  count("qelwatch_service_events_received_total", "Events of the service's source.",
        status->eventsReceived);
  count("qelwatch_service_events_delivered_total", "Events to clients of the service.",
        status->eventsDelivered);
  count("qelwatch_service_events_dropped_total", "Events that clients did not read in time.",
        status->eventsDropped);
  count("qelwatch_service_events_undecodable_total", "Events that nobody could decode.",
        status->eventsUndecodable);
  return told;
}

ServiceCounts::ServiceCounts(std::string bus) : _bus(std::move(bus)) {}
ServiceCounts::~ServiceCounts() = default;

void ServiceCounts::addTo(std::vector<MetricFamily>& families) {
  const std::lock_guard lock(_mutex);
  if (Clock::now() >= _next) {
    std::string why;
    _newest = serviceFamilies(tesk::bus::readServiceStatus({_bus}, why));
    _next = Clock::now() + std::chrono::seconds(1);
  }
  families.insert(families.end(), _newest.begin(), _newest.end());
}

}  // namespace qel::fleet
