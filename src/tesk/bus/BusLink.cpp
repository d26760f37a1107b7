#include "tesk/bus/BusLink.h"

#include <poll.h>
#include <sys/socket.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <limits>
#include <utility>

#include "base/PollTimeout.h"
#include "bus/Turn.h"
#include "tesk/bus/BasebandManager1Proxy.h"
#include "tesk/bus/EventPacket.h"
#include "tesk/bus/MessageConversion.h"
#include "tesk/bus/Reasons.h"

namespace tesk::bus {
namespace {

using namespace std::chrono_literals;

constexpr auto kInterface = tesk::BasebandManager1_proxy::INTERFACE_NAME;
constexpr auto kAnswerTimeout = 5s;
constexpr std::uint64_t kNoTimeout = std::numeric_limits<std::uint64_t>::max();
constexpr std::chrono::milliseconds kFirstPause = 250ms;
constexpr std::chrono::milliseconds kLongestPause = 2s;
// The bus keeps a record of every call that it denies.
constexpr std::chrono::milliseconds kLongestPauseWithoutPermission = 30s;
constexpr std::size_t kPacketsAtOnce = 256;

CommandResult unreachable(std::string_view why) { return {kServiceUnreachable, std::string(why)}; }

}  // namespace

BusLink::BusLink(const BusAddress& address, std::string clientName, EventSink sink, bool deliver,
                 ConditionObserver conditionObserver, std::chrono::milliseconds rest)
    : _clientName(std::move(clientName)),
      _sink(std::move(sink)),
      _connection(connectTo(address)),
      _proxy(sdbus::createProxy(*_connection, kServiceName, kObjectPath)),
      _condition(*_connection, *_proxy, std::move(conditionObserver)),
      _rest(rest),
      _deliver(deliver),
      _pause(kFirstPause) {
  watchOwner();
  beginToRegister();
}

BusLink::~BusLink() { detach(kNoBus); }

std::optional<BusLink::Reachability> BusLink::reachability() const {
  if (isOverdue(Clock::now())) return Reachability{false, std::string(kNoAnswer)};
  if (_busy) return Reachability{false, std::string(kBusy)};
  if (isAttached()) return Reachability{true, ""};
  if (!_why) return std::nullopt;
  return Reachability{false, *_why};
}

void BusLink::watchOwner() {
  const std::string rule = std::string("type='signal',sender='org.freedesktop.DBus',") +
                           "interface='org.freedesktop.DBus',member='NameOwnerChanged',arg0='" +
                           kServiceName + "'";
  _ownerMatch = _connection->addMatch(rule, [this](sdbus::Message&) { _ownerChanged = true; });
}

void BusLink::beginToRegister() {
  _tryAgainAt.reset();
  _registering = true;
  const auto answer = [this, number = ++_registration](const sdbus::Error* error,
                                                       sdbus::UnixFd stream) {
    if (number == _registration) registered(error, stream);
  };
  _proxy->callMethodAsync("Register")
      .onInterface(kInterface)
      .withTimeout(kAnswerTimeout)
      .withArguments(_clientName)
      .uponReplyInvoke(answer);
}

void BusLink::registered(const sdbus::Error* error, const sdbus::UnixFd& stream) {
  _registering = false;
  if (error) return failed(*error);
  if (!stream.isValid()) {
    detach(kRefused);
    return tryAgainLater(kLongestPause);
  }
  _stream = stream;
  _attachedAt = Clock::now();
  if (_deliver) askForDelivery();
  _condition.ask();
  for (Command& command : std::exchange(_waiting, {})) send(std::move(command));
}

void BusLink::failed(const sdbus::Error& error) {
  const auto why = reasonOf(error);
  detach(why);
  // A service that is not there is heard of when it comes.
  if (isAbsence(error)) return;
  tryAgainLater(why == kNoPermission ? kLongestPauseWithoutPermission : kLongestPause);
}

void BusLink::setDelivery(bool on) {
  _deliver = on;
  if (isAttached()) askForDelivery();
}

void BusLink::askForDelivery() {
  const auto answer = [this, number = _registration](const sdbus::Error* error) {
    if (number != _registration) return;
    if (!error) return becomeIdle();
    if (isBusy(*error)) return becomeBusy();
    failed(*error);
  };
  _proxy->callMethodAsync("SetDelivery")
      .onInterface(kInterface)
      .withTimeout(kNoTimeout)
      .withArguments(_deliver)
      .uponReplyInvoke(answer);
}

void BusLink::performCommand(Command command) {
  if (isAttached()) {
    send(std::move(command));
  } else if (_registering) {
    _waiting.push_back(std::move(command));
  } else {
    command.answer(unreachable(_why.value_or(std::string(kNotThere))), {});
  }
}

void BusLink::send(Command command) {
  if (command.isAbandoned()) return;
  const std::uint64_t number = ++_lastNumber;
  try {
    _proxy->callMethodAsync("PerformCommand")
        .onInterface(kInterface)
        .withTimeout(kNoTimeout)
        .withArguments(command.name, toVariants(command.request))
        .uponReplyInvoke([this, number](const sdbus::Error* error, std::int32_t code,
                                        std::string message, VariantMap entries) {
          answered(number, error, {code, std::move(message), std::move(entries)});
        });
    _sent.emplace(number, Sent{Clock::now(), std::move(command)});
  } catch (const sdbus::Error& error) {
    command.answer(unreachable(reasonOf(error)), {});
  }
}

void BusLink::answered(std::uint64_t number, const sdbus::Error* error, CommandReply reply) {
  auto sent = _sent.extract(number);
  if (sent.empty()) return;
  Command& command = sent.mapped().command;
  if (!error) {
    becomeIdle();
    auto& [code, message, entries] = reply;
    return command.answer({code, std::move(message)}, fromVariants(entries));
  }
  if (isBusy(*error)) {
    _waiting.push_back(std::move(command));
    return becomeBusy();
  }
  command.answer(unreachable(reasonOf(*error)), {});
  if (isNotRegistered(*error)) failed(*error);
}

void BusLink::becomeIdle() {
  if (std::exchange(_busy, false)) _pause = kFirstPause;
}

void BusLink::becomeBusy() {
  _busy = true;
  if (!_tryAgainAt) tryAgainLater(kLongestPause);
}

void BusLink::tryAgain() {
  if (!isAttached()) return beginToRegister();
  _tryAgainAt.reset();
  askForDelivery();
  for (Command& command : std::exchange(_waiting, {})) send(std::move(command));
}

void BusLink::detach(std::string_view why) {
  if (isAttached() && Clock::now() - _attachedAt > kLongestPause) _pause = kFirstPause;
  _stream.reset();
  _condition.forget();
  _registering = false;
  _busy = false;
  _tryAgainAt.reset();
  ++_registration;
  _why = why;
  for (const auto& [number, sent] : std::exchange(_sent, {})) {
    sent.command.answer(unreachable(why), {});
  }
  for (const Command& command : std::exchange(_waiting, {})) command.answer(unreachable(why), {});
}

void BusLink::tryAgainLater(std::chrono::milliseconds longestPause) {
  _tryAgainAt = Clock::now() + _pause;
  _pause = std::min(_pause * 2, longestPause);
}

bool BusLink::isOverdue(Clock::time_point now) const {
  return !_sent.empty() && now - _sent.begin()->second.at >= kAnswerTimeout;
}

int BusLink::timeout(const sdbus::IConnection::PollData& bus) const {
  const auto now = Clock::now();
  auto next = _tryAgainAt;
  if (_restsUntil) next = next ? std::min(*next, *_restsUntil) : _restsUntil;
  if (!_sent.empty() && !isOverdue(now)) {
    const auto overdueAt = _sent.begin()->second.at + kAnswerTimeout;
    next = next ? std::min(*next, overdueAt) : overdueAt;
  }
  return qel::shorterTimeout(qel::pollTimeout(next), bus.getPollTimeout());
}

bool BusLink::waitAndProcess(int wakeDescriptor) {
  const auto bus = _connection->getEventLoopPollData();
  std::array<pollfd, 3> waited = {{{bus.fd, bus.events, 0},
                                   {wakeDescriptor, POLLIN, 0},
                                   {isAttached() && !_restsUntil ? _stream.get() : -1, POLLIN, 0}}};
  ::poll(waited.data(), waited.size(), timeout(bus));
  const bool hasRested = _restsUntil && Clock::now() >= *_restsUntil;
  if (waited[2].revents != 0 || hasRested) processStream();
  if (waited[0].revents != 0 || bus.getPollTimeout() == 0) processBus();
  if (_tryAgainAt && Clock::now() >= *_tryAgainAt) tryAgain();
  return waited[1].revents != 0;
}

void BusLink::processBus() {
  qel::bus::processTurn(*_connection);
  if (!std::exchange(_ownerChanged, false)) return;
  // Whoever owns the name now knows nothing of us, and the old stream was the old owner's.
  _pause = kFirstPause;
  auto waiting = std::exchange(_waiting, {});
  detach(kNotThere);
  _waiting = std::move(waiting);
  beginToRegister();
}

void BusLink::processStream() {
  const std::size_t events = readEvents();
  _restsUntil = isAttached() ? _rest.after(events, Clock::now()) : std::nullopt;
}

std::size_t BusLink::readEvents() {
  std::array<std::uint8_t, kLargestPacket + 1> packet;
  std::size_t events = 0;
  for (; isAttached() && events < kPacketsAtOnce; ++events) {
    const ssize_t size = ::recv(_stream.get(), packet.data(), packet.size(), MSG_DONTWAIT);
    if (size < 0 && (errno == EAGAIN || errno == EINTR)) break;
    if (size <= 0) {
      detach(kNotThere);
      tryAgainLater(kLongestPause);
      break;
    }
    auto event = decodeEvent({packet.data(), static_cast<std::size_t>(size)});
    if (event && isIdentified(*event)) {
      _sink(event->name, std::move(event->message));
    }
  }
  return events;
}

}  // namespace tesk::bus
