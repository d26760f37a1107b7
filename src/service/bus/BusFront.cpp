#include "service/bus/BusFront.h"

#include <poll.h>

#include <algorithm>

#include "service/bus/BusErrors.h"
#include "tesk/bus/MessageConversion.h"

namespace qel::service {
namespace {

using namespace std::chrono_literals;
using SteadyClock = std::chrono::steady_clock;

constexpr auto kCountersEvery = 5s;
constexpr std::size_t kMostClients = 64;

}  // namespace

BusFront::BusFront(sdbus::IConnection& connection, std::shared_ptr<ServiceCore> core)
    : AdaptorInterfaces(connection, tesk::bus::kObjectPath),
      _connection(connection),
      _core(std::move(core)) {
  registerAdaptor();
  _connection.requestName(tesk::bus::kServiceName);
}

BusFront::~BusFront() {
  _clients.clear();
  unregisterAdaptor();
}

std::string BusFront::caller() const {
  return getObject().getCurrentlyProcessedMessage()->getSender();
}

BusClient& BusFront::callingClient() {
  const auto found = _clients.find(caller());
  if (found == _clients.end()) throw notRegistered();
  return *found->second;
}

sdbus::UnixFd BusFront::Register(const std::string& clientName) {
  const std::string busName = caller();
  if (clientName.empty()) throw invalidName();
  forget(busName);
  if (_clients.size() >= kMostClients) throw tooManyClients();
  auto client =
      std::make_unique<BusClient>(_core, clientName, [wakeUp = _wakeUp] { wakeUp->signal(); });
  client->vanishWatch = _connection.addMatch(
      "type='signal',sender='org.freedesktop.DBus',interface='org.freedesktop.DBus',"
      "member='NameOwnerChanged',arg0='" +
          busName + "'",
      [this, busName](sdbus::Message&) { _vanished.push_back(busName); });
  sdbus::UnixFd clientEnd = client->takeClientEnd();
  _clients.emplace(busName, std::move(client));
  changed({"Clients"});
  return clientEnd;
}

void BusFront::SetDelivery(const bool& on) {
  Session& session = callingClient().session();
  if (on) {
    _core->eventsOn(session);
  } else {
    _core->eventsOff(session);
  }
  changed({"Clients", "SourceRunning"});
}

std::tuple<std::int32_t, std::string, std::map<std::string, sdbus::Variant>>
BusFront::PerformCommand(const std::string& command,
                         const std::map<std::string, sdbus::Variant>& request) {
  Session& session = callingClient().session();
  auto result = _core->performCommand(session, command, tesk::bus::fromVariants(request));
  changed({"Configurations"});
  return {result.code, std::move(result.message), {}};
}

void BusFront::forget(const std::string& busName) {
  const auto found = _clients.find(busName);
  if (found == _clients.end()) return;
  _droppedOfGone += found->second->stream().dropped();
  _clients.erase(found);
  changed({"Clients", "SourceRunning"});
}

int BusFront::pollTimeout(const sdbus::IConnection::PollData& bus) const {
  const int timeout = bus.getPollTimeout();
  if (counted() == _signalled) return timeout;
  const auto due = _signalledAt + kCountersEvery - SteadyClock::now();
  const auto left = std::chrono::ceil<std::chrono::milliseconds>(due).count();
  const int wait = std::max(0, static_cast<int>(left));
  return timeout < 0 ? wait : std::min(timeout, wait);
}

void BusFront::waitAndProcess(int stopDescriptor) {
  const auto bus = _connection.getEventLoopPollData();
  std::vector<pollfd> waited = {
      {bus.fd, bus.events, 0}, {stopDescriptor, POLLIN, 0}, {_wakeUp->descriptor(), POLLIN, 0}};
  const std::size_t fixed = waited.size();
  for (const auto& [busName, client] : _clients) {
    waited.push_back({client->stream().descriptor(), client->stream().pollEvents(), 0});
  }
  ::poll(waited.data(), waited.size(), pollTimeout(bus));
  _wakeUp->clear();
  std::vector<short> happened;
  for (std::size_t i = fixed; i < waited.size(); ++i) happened.push_back(waited[i].revents);
  serveStreams(happened);
  while (_connection.processPendingRequest()) {
  }
  for (const std::string& busName : std::exchange(_vanished, {})) forget(busName);
  if (SteadyClock::now() - _signalledAt >= kCountersEvery) signalCounters();
}

// In the order of the clients. A client never writes: what can be read is the end of its socket.
void BusFront::serveStreams(const std::vector<short>& happened) {
  std::size_t i = 0;
  for (const auto& [busName, client] : _clients) {
    EventStream& stream = client->stream();
    const short events = happened[i++];
    if ((events & POLLOUT) != 0) stream.flush();
    if ((events & (POLLIN | POLLHUP | POLLERR)) != 0 || stream.isBroken()) {
      _vanished.push_back(busName);
    }
  }
}

void BusFront::changed(const std::vector<std::string>& properties) {
  getObject().emitPropertiesChangedSignal(INTERFACE_NAME, properties);
}

BusFront::Counted BusFront::counted() const {
  const CoreStatus status = _core->status();
  std::uint64_t dropped = _droppedOfGone;
  for (const auto& [busName, client] : _clients) dropped += client->stream().dropped();
  return {status.received, status.delivered, dropped, status.undecodable, status.withoutContent};
}

void BusFront::signalCounters() {
  const Counted now = counted();
  if (now == _signalled) return;
  std::vector<std::string> properties;
  if (now.received != _signalled.received) properties.emplace_back("EventsReceived");
  if (now.delivered != _signalled.delivered) properties.emplace_back("EventsDelivered");
  if (now.dropped != _signalled.dropped) properties.emplace_back("EventsDropped");
  if (now.undecodable != _signalled.undecodable) properties.emplace_back("EventsUndecodable");
  if (now.withoutContent != _signalled.withoutContent) {
    properties.emplace_back("EventsWithoutContent");
  }
  _signalled = now;
  _signalledAt = SteadyClock::now();
  changed(properties);
}

}  // namespace qel::service
