#include "bus/MoodyService.h"

#include <sys/socket.h>

#include <array>
#include <stdexcept>
#include <utility>

#include "tesk/bus/BusAddress.h"

namespace qel::testing {
namespace {

constexpr const char* kInterface = "tesk.BasebandManager1";

sdbus::Error busy() {
  return sdbus::Error("org.freedesktop.DBus.Error.LimitsExceeded", "too many calls of this caller");
}

}  // namespace

MoodyService::MoodyService(const PrivateBus& bus, Mood atRegistration, Mood atCommands)
    : _connection(tesk::bus::connectTo({bus.address()})),
      _object(sdbus::createObject(*_connection, tesk::bus::kObjectPath)),
      _atRegistration(atRegistration),
      _atCommands(atCommands) {
  _object->registerMethod("Register")
      .onInterface(kInterface)
      .implementedAs([this](Registration&& registration, const std::string&) {
        {
          const std::lock_guard lock(_mutex);
          ++_registrations;
        }
        take(std::move(registration));
      });
  _object->registerMethod("SetDelivery")
      .onInterface(kInterface)
      .implementedAs([this](const bool& on) {
        const std::lock_guard lock(_mutex);
        if (isTooBusy(_atCommands)) throw busy();
        _delivers = on;
      });
  _object->registerMethod("PerformCommand")
      .onInterface(kInterface)
      .implementedAs([this](Command&& command, const std::string& name, const Entries&) {
        {
          const std::lock_guard lock(_mutex);
          if (_atCommands != Mood::isBusy) _commands.push_back(name);
        }
        take(std::move(command));
      });
  _object->registerProperty("Condition").onInterface(kInterface).withGetter([this] {
    const std::lock_guard lock(_mutex);
    return Entries{{"text", sdbus::Variant(_condition)}};
  });
  _object->finishRegistration();
  _connection->requestName(tesk::bus::kServiceName);
  _connection->enterEventLoopAsync();
}

MoodyService::~MoodyService() { _connection->leaveEventLoop(); }

bool MoodyService::isTooBusy(Mood mood) {
  if (mood != Mood::isBusy) return false;
  ++_refusals;
  return true;
}

void MoodyService::take(Registration registration) {
  sdbus::UnixFd stream;
  Mood mood;
  bool tooBusy;
  {
    const std::lock_guard lock(_mutex);
    mood = _atRegistration;
    if (mood == Mood::saysNothing) return _unregistered.push_back(std::move(registration));
    if (mood == Mood::answers) stream = streamTo(_streams);
    tooBusy = isTooBusy(mood);
  }
  if (tooBusy) return registration.returnError(busy());
  if (mood == Mood::answers) return registration.returnResults(stream);
  registration.returnError(
      sdbus::Error("tesk.BasebandManager1.Error.TooManyClients", "too many clients"));
}

void MoodyService::take(Command command) {
  Mood mood;
  bool tooBusy;
  {
    const std::lock_guard lock(_mutex);
    mood = _atCommands;
    if (mood == Mood::saysNothing) return _unanswered.push_back(std::move(command));
    tooBusy = isTooBusy(mood);
  }
  if (tooBusy) return command.returnError(busy());
  command.returnResults(mood == Mood::answers ? 0 : 7, "as told", {});
}

sdbus::UnixFd MoodyService::streamTo(std::vector<sdbus::UnixFd>& kept) {
  std::array<int, 2> ends{};
  if (::socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends.data()) != 0) {
    throw std::runtime_error("no socket pair");
  }
  kept.emplace_back(ends[0], sdbus::adopt_fd);
  return sdbus::UnixFd(ends[1], sdbus::adopt_fd);
}

void MoodyService::setMoods(Mood atRegistration, Mood atCommands) {
  std::vector<Registration> unregistered;
  std::vector<Command> unanswered;
  {
    const std::lock_guard lock(_mutex);
    _atRegistration = atRegistration;
    _atCommands = atCommands;
    unregistered.swap(_unregistered);
    unanswered.swap(_unanswered);
  }
  for (auto& registration : unregistered) take(std::move(registration));
  for (auto& command : unanswered) take(std::move(command));
}

void MoodyService::setCondition(std::string text) {
  const std::lock_guard lock(_mutex);
  _condition = std::move(text);
}

void MoodyService::send(const qel::Bytes& packet) const {
  const std::lock_guard lock(_mutex);
  for (const sdbus::UnixFd& stream : _streams) {
    (void)!::send(stream.get(), packet.data(), packet.size(), MSG_NOSIGNAL);
  }
}

std::vector<std::string> MoodyService::commands() const {
  const std::lock_guard lock(_mutex);
  return _commands;
}

int MoodyService::registrations() const {
  const std::lock_guard lock(_mutex);
  return _registrations;
}

int MoodyService::refusals() const {
  const std::lock_guard lock(_mutex);
  return _refusals;
}

bool MoodyService::delivers() const {
  const std::lock_guard lock(_mutex);
  return _delivers;
}

}  // namespace qel::testing
