#include "tesk/bus/BusLink.h"

#include <poll.h>
#include <sys/socket.h>

#include <algorithm>
#include <array>
#include <cerrno>

#include "tesk/bus/BasebandManager1Proxy.h"
#include "tesk/bus/EventPacket.h"
#include "tesk/bus/MessageConversion.h"

namespace tesk::bus {
namespace {

using namespace std::chrono_literals;

constexpr auto kCallTimeout = 5s;
constexpr auto kTryAgainAfter = 1s;
constexpr int kPacketsAtOnce = 256;

std::string reasonOf(const sdbus::Error& error) {
  if (error.getName() == "org.freedesktop.DBus.Error.AccessDenied") {
    return "no permission to use the baseband manager service (is the user in group baseband?)";
  }
  return "baseband manager service not reachable";
}

}  // namespace

class ManagerProxy final : public sdbus::ProxyInterfaces<tesk::BasebandManager1_proxy> {
 public:
  explicit ManagerProxy(sdbus::IConnection& connection)
      : ProxyInterfaces(connection, kServiceName, kObjectPath) {
    registerProxy();
  }
  ~ManagerProxy() { unregisterProxy(); }
};

BusLink::BusLink(const BusAddress& address, std::string clientName, EventSink sink)
    : _clientName(std::move(clientName)), _sink(std::move(sink)), _connection(connectTo(address)) {
  _connection->setMethodCallTimeout(kCallTimeout);
  watchOwner();
  _proxy = std::make_unique<ManagerProxy>(*_connection);
}

BusLink::~BusLink() = default;

void BusLink::watchOwner() {
  const std::string rule = std::string("type='signal',sender='org.freedesktop.DBus',") +
                           "interface='org.freedesktop.DBus',member='NameOwnerChanged',arg0='" +
                           kServiceName + "'";
  _ownerMatch = _connection->addMatch(rule, [this](sdbus::Message&) { _ownerChanged = true; });
}

bool BusLink::attach() {
  if (isAttached()) return true;
  _tryAgainAt.reset();
  try {
    _stream = _proxy->Register(_clientName);
    if (_deliver) _proxy->SetDelivery(true);
    return true;
  } catch (const sdbus::Error& error) {
    detach(reasonOf(error));
    return false;
  }
}

void BusLink::detach(std::string why) {
  _stream.reset();
  _why = std::move(why);
}

void BusLink::setDelivery(bool on) {
  _deliver = on;
  if (!isAttached()) return;
  try {
    _proxy->SetDelivery(on);
  } catch (const sdbus::Error& error) {
    detach(reasonOf(error));
  }
}

CommandResult BusLink::performCommand(std::string_view command, const Message& request,
                                      Message& reply) {
  if (!attach()) return {kServiceUnreachable, _why};
  try {
    auto [code, message, entries] =
        _proxy->PerformCommand(std::string(command), toVariants(request));
    reply = fromVariants(entries);
    return {code, std::move(message)};
  } catch (const sdbus::Error& error) {
    return {kServiceUnreachable, reasonOf(error)};
  }
}

int BusLink::pollTimeout(const sdbus::IConnection::PollData& bus) const {
  int timeout = bus.getPollTimeout();
  if (_tryAgainAt) {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(*_tryAgainAt - Clock::now());
    const int wait = std::max(0, static_cast<int>(left.count()));
    timeout = timeout < 0 ? wait : std::min(timeout, wait);
  }
  return timeout;
}

void BusLink::waitAndProcess(int wakeDescriptor) {
  const auto bus = _connection->getEventLoopPollData();
  std::array<pollfd, 3> waited = {{{bus.fd, bus.events, 0},
                                   {wakeDescriptor, POLLIN, 0},
                                   {isAttached() ? _stream.get() : -1, POLLIN, 0}}};
  ::poll(waited.data(), waited.size(), pollTimeout(bus));
  if (waited[2].revents != 0) processStream();
  processBus();
  if (_tryAgainAt && Clock::now() >= *_tryAgainAt) attach();
}

void BusLink::processBus() {
  while (_connection->processPendingRequest()) {
  }
  if (!std::exchange(_ownerChanged, false)) return;
  // Whoever owns the name now knows nothing of us, and the old stream was the old owner's.
  detach("baseband manager service not reachable");
  attach();
}

void BusLink::processStream() {
  std::array<std::uint8_t, kLargestPacket + 1> packet;
  for (int i = 0; i < kPacketsAtOnce; ++i) {
    const ssize_t size = ::recv(_stream.get(), packet.data(), packet.size(), MSG_DONTWAIT);
    if (size < 0 && (errno == EAGAIN || errno == EINTR)) return;
    if (size <= 0) {
      detach("baseband manager service not reachable");
      _tryAgainAt = Clock::now() + kTryAgainAfter;
      return;
    }
    if (auto event = decodeEvent({packet.data(), static_cast<std::size_t>(size)})) {
      _sink(event->name, std::move(event->message));
    }
  }
}

}  // namespace tesk::bus
