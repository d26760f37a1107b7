// The properties of the service on the bus.

#include "service/bus/BusFront.h"

namespace qel::service {
namespace {

// A message on the bus has room for them all.
constexpr std::size_t kMostFacts = 1200;

}  // namespace

const CoreStatus& BusFront::status() const {
  if (!_status) _status = _core->status();
  return *_status;
}

BusFront::Counted BusFront::counted() const {
  std::uint64_t dropped = _droppedOfGone;
  for (const auto& [busName, client] : _clients) dropped += client->stream().dropped();
  const CoreStatus& now = status();
  return {now.received, now.delivered, dropped, now.undecodable, now.withoutContent};
}

void BusFront::noteCounters() {
  const Counted now = counted();
  if (now == _noted) return;
  if (now.received != _noted.received) _changed.note({"EventsReceived"});
  if (now.delivered != _noted.delivered) _changed.note({"EventsDelivered"});
  if (now.dropped != _noted.dropped) _changed.note({"EventsDropped"});
  if (now.undecodable != _noted.undecodable) _changed.note({"EventsUndecodable"});
  if (now.withoutContent != _noted.withoutContent) _changed.note({"EventsWithoutContent"});
  _noted = now;
  _notedAt = std::chrono::steady_clock::now();
}

std::string BusFront::Version() { return QEL_VERSION; }
std::string BusFront::Source() { return status().source; }
bool BusFront::SourceRunning() { return status().sourceRunning; }

std::map<std::string, sdbus::Variant> BusFront::Condition() {
  const sources::SourceCondition condition = _core->condition().current();
  std::map<std::string, sdbus::Variant> entries;
  const auto put = [&entries](const char* key, std::string text) {
    if (!text.empty()) entries.emplace(key, std::move(text));
  };
  put("state", std::string(condition.state));
  put("text", sources::inWords(condition));
  put("reason", std::string(condition.reason));
  put("model", condition.model);
  put("driver", condition.driver);
  return entries;
}

std::vector<sdbus::Struct<std::string, std::string>> BusFront::SourceFacts() {
  std::vector<sdbus::Struct<std::string, std::string>> rows;
  for (auto& [name, value] : _core->facts().rows) {
    if (rows.size() == kMostFacts) break;
    rows.emplace_back(std::make_tuple(name, value));
  }
  return rows;
}

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
