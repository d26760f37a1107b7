#include "service/bus/BusFront.h"

#include <poll.h>

#include <utility>

#include "base/PollTimeout.h"
#include "service/bus/BusErrors.h"
#include "service/bus/CallLimits.h"
#include "tesk/Constants.h"
#include "tesk/bus/MessageConversion.h"

namespace qel::service {
namespace {

using namespace std::chrono_literals;
using SteadyClock = std::chrono::steady_clock;

constexpr auto kCountersEvery = 5s;
constexpr auto kTaking = 8ms;
constexpr auto kAnswering = 4ms;
constexpr std::size_t kMostClients = 64;
constexpr int kMostRegistrations = 8;  // of one caller
constexpr auto kRegistrationsEvery = 10s;

constexpr const char* kOwnerLost =
    "type='signal',sender='org.freedesktop.DBus',interface='org.freedesktop.DBus',"
    "member='NameOwnerChanged',arg2=''";

// Nobody waits for an answer that cannot be sent.
void answerWith(const sdbus::MethodCall& call, const sdbus::Error& error) {
  try {
    call.createErrorReply(error).send();
  } catch (const sdbus::Error&) {
  }
}

void answerWith(const sdbus::MethodCall& call, const tesk::CommandResult& result) {
  auto reply = call.createReply();
  reply << result.code << result.message << tesk::bus::VariantMap();
  reply.send();
}

}  // namespace

BusFront::BusFront(sdbus::IConnection& connection, std::shared_ptr<ServiceCore> core)
    : FrontObject{{sdbus::createObject(connection, tesk::bus::kObjectPath),
                   [this](const std::string& method, const sdbus::MethodCall& call,
                          const sdbus::method_callback& answer) {
                     arrived(method, call, answer);
                   }}},
      BasebandManager1_adaptor(FrontObject::object),
      _connection(connection),
      _core(std::move(core)) {
  // One watch for all clients: to ask for one would wait for the bus, and so would all callers.
  _ownerWatch =
      _connection.addMatch(kOwnerLost, [this](sdbus::Message& signal) { noteOwnerChange(signal); });
  _filter.emplace(object, [this](CallFilter::Kind kind, std::string_view caller) {
    if (kind == CallFilter::Kind::own) return !_calls.isFullFor(caller);
    _isRead = _reads.allows(caller);
    return _isRead;
  });
  object.finishRegistration();
  _core->condition().observe([wakeUp = _wakeUp] { wakeUp->signal(); });
  _connection.requestName(tesk::bus::kServiceName);
}

BusFront::~BusFront() {
  _core->condition().observe({});
  _clients.clear();
  object.unregister();
}

void BusFront::arrived(const std::string& method, const sdbus::MethodCall& call,
                       const sdbus::method_callback& answer) {
  const std::string caller = call.getSender();
  sdbus::MethodCall looked = call;
  if (method == "Register") {
    const std::string fault = faultOfRegister(looked);
    if (!fault.empty()) throw invalidName(fault);
  }
  if (method == "PerformCommand") {
    const auto refused = refusedRequest(looked);
    if (refused) return answerWith(call, *refused);
  }
  _calls.add(caller, {[this, call, answer] { answerCall(call, answer); },
                      [call] { answerWith(call, tooManyCalls()); }});
}

void BusFront::answerCall(const sdbus::MethodCall& call, const sdbus::method_callback& answer) {
  _caller = call.getSender();
  try {
    answer(call);
  } catch (const sdbus::Error& error) {
    answerWith(call, error);
  }
  _status.reset();
}

BusClient& BusFront::callingClient() {
  const auto found = _clients.find(_caller);
  if (found == _clients.end()) throw notRegistered();
  return *found->second;
}

// The bus daemon holds the sockets that a caller does not fetch, and stops listening to a service
// that has sent it some dozens of them.
void BusFront::noteRegistration() {
  Registrations& registrations = _registrations[_caller];
  const auto now = SteadyClock::now();
  if (now - registrations.since >= kRegistrationsEvery) registrations = {now, 0};
  if (++registrations.count > kMostRegistrations) throw tooManyRegistrations();
}

sdbus::UnixFd BusFront::Register(const std::string& clientName) {
  noteRegistration();
  forget(_caller);
  if (_clients.size() >= kMostClients) throw tooManyClients();
  auto client = std::make_unique<BusClient>(
      _core, clientName, [wakeUp = _wakeUp] { wakeUp->signal(); }, _backlogs);
  sdbus::UnixFd clientEnd = client->takeClientEnd();
  _clients.emplace(_caller, std::move(client));
  _changed.note({"Clients"});
  return clientEnd;
}

void BusFront::SetDelivery(const bool& on) {
  Session& session = callingClient().session();
  if (session.status().eventsOn == on) return;
  if (on) {
    _core->eventsOn(session);
  } else {
    _core->eventsOff(session);
  }
  _changed.note({"Clients", "SourceRunning"});
}

std::tuple<std::int32_t, std::string, std::map<std::string, sdbus::Variant>>
BusFront::PerformCommand(const std::string& command,
                         const std::map<std::string, sdbus::Variant>& request) {
  Session& session = callingClient().session();
  auto result = _core->performCommand(session, command, tesk::bus::fromVariants(request));
  if (result.code == 0 && command != tesk::kCommandQueryMetric) _changed.note({"Configurations"});
  return {result.code, std::move(result.message), {}};
}

void BusFront::noteOwnerChange(sdbus::Message& signal) {
  std::string name;
  signal >> name;
  if (!name.starts_with(':')) return;
  _calls.forget(name);
  _registrations.erase(name);
  _vanished.push_back(std::move(name));
}

void BusFront::forget(const std::string& busName) {
  const auto found = _clients.find(busName);
  if (found == _clients.end()) return;
  _droppedOfGone += found->second->stream().dropped();
  _clients.erase(found);
  _changed.note({"Clients", "SourceRunning"});
}

bool BusFront::isBusBehind() const {
  return (_connection.getEventLoopPollData().events & POLLOUT) != 0;
}

int BusFront::timeout(const sdbus::IConnection::PollData& bus) const {
  const bool isBehind = (bus.events & POLLOUT) != 0;
  int timeout = bus.getPollTimeout();
  if (isBehind) return timeout;
  if (!_calls.empty()) return 0;
  timeout = shorterTimeout(timeout, pollTimeout(_changed.due()));
  if (counted() == _noted) return timeout;
  return shorterTimeout(timeout, pollTimeout(_notedAt + kCountersEvery));
}

void BusFront::waitAndProcess(int stopDescriptor) {
  _status.reset();
  const auto bus = _connection.getEventLoopPollData();
  const bool isBehind = (bus.events & POLLOUT) != 0;
  const short busEvents = isBehind ? short{POLLOUT} : bus.events;
  std::vector<pollfd> waited = {
      {bus.fd, busEvents, 0}, {stopDescriptor, POLLIN, 0}, {_wakeUp->descriptor(), POLLIN, 0}};
  const std::size_t fixed = waited.size();
  for (const auto& [busName, client] : _clients) {
    waited.push_back({client->stream().descriptor(), client->stream().pollEvents(), 0});
  }
  ::poll(waited.data(), waited.size(), timeout(bus));
  _status.reset();  // events went on meanwhile
  _wakeUp->clear();
  std::vector<short> happened;
  for (std::size_t i = fixed; i < waited.size(); ++i) happened.push_back(waited[i].revents);
  serveStreams(happened);
  if (!isBehind || waited.front().revents != 0) takeCalls();
  for (const std::string& busName : std::exchange(_vanished, {})) forget(busName);
  answerCalls();
  signalChanges();
}

void BusFront::takeCalls() {
  _reads.nextTurn();
  auto now = SteadyClock::now();
  const auto end = now + kTaking;
  while (_connection.processPendingRequest()) {
    const auto before = std::exchange(now, SteadyClock::now());
    if (std::exchange(_isRead, false)) _reads.spend(now - before);
    if (now >= end || isBusBehind()) return;
  }
}

void BusFront::answerCalls() {
  const auto end = SteadyClock::now() + kAnswering;
  while (!_calls.empty() && !isBusBehind() && SteadyClock::now() < end) _calls.answerNext();
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

// What the counters say changes all the time and is told now and then.
void BusFront::signalChanges() {
  if (SteadyClock::now() - _notedAt >= kCountersEvery) noteCounters();
  noteCondition();
  if (isBusBehind()) return;
  const auto names = _changed.take(SteadyClock::now());
  if (!names.empty()) object.emitPropertiesChangedSignal(INTERFACE_NAME, names);
}

void BusFront::noteCondition() {
  sources::SourceCondition now = _core->condition().current();
  if (now == _notedCondition) return;
  _notedCondition = std::move(now);
  _changed.note({"Condition"});
}

}  // namespace qel::service
