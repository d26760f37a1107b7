#include "service/ServiceCore.h"

#include <algorithm>
#include <utility>

#include "messages/catalogue/TagLog.h"

namespace qel::service {

std::shared_ptr<ServiceCore> ServiceCore::create(std::unique_ptr<sources::EventSource> source,
                                                 const Clock& clock,
                                                 std::unique_ptr<StateKeeper> keeper,
                                                 sources::WaitClock& waitClock) {
  return std::shared_ptr<ServiceCore>(
      new ServiceCore(std::move(source), clock, std::move(keeper), waitClock));
}

ServiceCore::ServiceCore(std::unique_ptr<sources::EventSource> source, const Clock& clock,
                         std::unique_ptr<StateKeeper> keeper, sources::WaitClock& waitClock)
    : _undecodableLog(clock),
      _tagLog(clock, "not logged one by one: "),
      _condition(clock),
      _book(std::move(keeper), _configurations, clock, waitClock),
      _source(std::move(source)) {}

ServiceCore::~ServiceCore() { _source->stop(); }

std::shared_ptr<Session> ServiceCore::open(std::string_view clientName, tesk::EventSink sink) {
  auto session = std::make_shared<Session>(std::string(clientName), std::move(sink),
                                           _configurations, _book.opened(clientName));
  const std::lock_guard lock(_mutex);
  auto sessions = std::make_shared<Sessions>(*_sessions);
  sessions->push_back(session);
  _sessions = std::move(sessions);
  return session;
}

void ServiceCore::close(const std::shared_ptr<Session>& session) {
  session->close();
  const std::lock_guard lock(_mutex);
  auto sessions = std::make_shared<Sessions>(*_sessions);
  if (std::erase(*sessions, session) == 0) return;
  _sessions = std::move(sessions);
  _book.closed(session->clientName());
  if (_sessions->empty() && _sourceRunning) {
    _source->stop();
    _sourceRunning = false;
    _condition.forget();
  }
}

void ServiceCore::eventsOn(Session& session) {
  if (!session.eventsOn()) return;
  _listeners->changed();
  const std::lock_guard lock(_mutex);
  if (_sourceRunning || _sessions->empty()) return;
  _source->start(weak_from_this(), _listeners);
  _sourceRunning = true;
}

void ServiceCore::eventsOff(Session& session) { session.eventsOff(); }

std::shared_ptr<const ServiceCore::Sessions> ServiceCore::sessions() const {
  const std::lock_guard lock(_mutex);
  return _sessions;
}

// Whoever receives the event reads it again: what that logs is not to be said twice, nor is one
// payload to fill the log.
std::optional<EventSubject> ServiceCore::examine(const sources::SourceEvent& event,
                                                 EventFault& fault) {
  const CountedTagLines lines;
  auto subject = examineEvent(event, fault);
  noteTagLines(lines.count());
  return subject;
}

void ServiceCore::noteTagLines(std::size_t lines) {
  if (lines == 0) return;
  _tagLog.note(std::to_string(lines) + " lines about metric identifiers in place of fields");
}

sources::EventReceiver::Taken ServiceCore::take(const sources::SourceEvent& event) {
  EventFault fault;
  const auto subject = examine(event, fault);
  if (!subject) {
    ++_received;
    ++(fault.withoutContent ? _withoutContent : _undecodable);
    _undecodableLog.note(fault.reason);
    return Taken::yes;
  }
  // Whether anyone listens is known only from the offers themselves: a look beforehand could be
  // overtaken by a client that switches its events off and on again.
  const auto open = sessions();
  Sequence<Session::Offer> offers;
  for (const auto& session : *open) offers.push_back(session->offer(event, *subject));
  const bool heard = std::ranges::any_of(offers, [](Session::Offer offer) {
    return offer == Session::Offer::delivered || offer == Session::Offer::notWanted;
  });
  if (!heard) return Taken::nobodyListens;
  ++_received;
  for (std::size_t i = 0; i < offers.size(); ++i) {
    (*open)[i]->pass(offers[i]);
    switch (offers[i]) {
      case Session::Offer::delivered:
        ++_delivered;
        break;
      case Session::Offer::notWanted:
      case Session::Offer::unconfigured:
        ++_droppedByConfiguration;
        break;
      case Session::Offer::off:
        ++_droppedWhileOff;
        break;
    }
  }
  return Taken::yes;
}

void ServiceCore::conditionChanged(const sources::SourceCondition& condition) {
  // Not the last words of a source that was stopped.
  const std::lock_guard lock(_mutex);
  if (_sourceRunning) _condition.note(condition);
}

CoreStatus ServiceCore::status() const {
  CoreStatus status;
  status.source = _source->description();
  {
    const std::lock_guard lock(_mutex);
    status.sourceRunning = _sourceRunning;
    for (const auto& session : *_sessions) status.sessions.push_back(session->status());
  }
  status.received = _received;
  status.delivered = _delivered;
  status.undecodable = _undecodable;
  status.withoutContent = _withoutContent;
  status.droppedByConfiguration = _droppedByConfiguration;
  status.droppedWhileOff = _droppedWhileOff;
  status.commands = _commands;
  status.refusedCommands = _refusedCommands;
  return status;
}

}  // namespace qel::service
