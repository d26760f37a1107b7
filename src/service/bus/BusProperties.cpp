// The properties of the service on the bus.

#include "service/bus/BusFront.h"

namespace qel::service {

std::string BusFront::Version() { return QEL_VERSION; }
std::string BusFront::Source() { return _core->status().source; }
bool BusFront::SourceRunning() { return _core->status().sourceRunning; }

std::map<std::int64_t, std::uint32_t> BusFront::Configurations() {
  return _core->configurationSizes();
}

std::vector<sdbus::Struct<std::string, bool, std::uint64_t, std::uint64_t>> BusFront::Clients() {
  std::vector<sdbus::Struct<std::string, bool, std::uint64_t, std::uint64_t>> clients;
  for (const auto& [busName, client] : _clients) {
    const SessionStatus status = client->session().status();
    clients.emplace_back(std::make_tuple(status.clientName, status.eventsOn, status.delivered,
                                         client->stream().dropped()));
  }
  return clients;
}

std::uint64_t BusFront::EventsReceived() { return counted().received; }
std::uint64_t BusFront::EventsDelivered() { return counted().delivered; }
std::uint64_t BusFront::EventsDropped() { return counted().dropped; }
std::uint64_t BusFront::EventsUndecodable() { return counted().undecodable; }
std::uint64_t BusFront::EventsWithoutContent() { return counted().withoutContent; }

}  // namespace qel::service
