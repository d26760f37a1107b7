#include "service/Session.h"

#include <utility>

namespace qel::service {

Session::Session(std::string clientName, tesk::EventSink sink,
                 const ConfigurationStore& configurations, std::optional<std::int64_t> application)
    : _clientName(std::move(clientName)),
      _sink(std::move(sink)),
      _configurations(configurations),
      _application(application) {}

std::optional<std::int64_t> Session::application() const {
  const std::lock_guard lock(_applicationMutex);
  return _application;
}

void Session::setApplication(std::int64_t application) {
  const std::lock_guard lock(_applicationMutex);
  _application = application;
}

bool Session::eventsOn() {
  const std::lock_guard lock(_deliveryMutex);
  return !_closed && !_on.exchange(true);
}

void Session::eventsOff() {
  const std::lock_guard lock(_deliveryMutex);
  _on = false;
}

void Session::close() {
  const std::lock_guard lock(_deliveryMutex);
  _closed = true;
  _on = false;
}

void Session::deliver(const sources::SourceEvent& event) {
  ++_delivered;
  _sink(event.stream, tesk::Message(event.entries));
}

bool Session::wants(const DeviceConfiguration& configuration, const sources::SourceEvent& event,
                    const EventSubject& subject) {
  if (!subject.isMetric) return configuration.wantsTrigger(subject.identifier);
  const auto periodMs = configuration.periodMs(static_cast<std::uint32_t>(subject.identifier));
  if (!periodMs) return false;
  if (*periodMs == 0) return true;
  const auto [last, isFirst] = _deliveredAtMs.try_emplace(subject.identifier, event.timeMs);
  if (isFirst) return true;
  // A source that begins anew goes back in time.
  const bool wentBack = event.timeMs < last->second;
  if (!wentBack && event.timeMs - last->second < *periodMs) return false;
  last->second = event.timeMs;
  return true;
}

Session::Offer Session::offer(const sources::SourceEvent& event, const EventSubject& subject) {
  const std::lock_guard lock(_deliveryMutex);
  if (!_on) return Offer::off;
  const auto application = this->application();
  const auto configuration = application ? _configurations.find(*application) : nullptr;
  if (!configuration) return Offer::unconfigured;
  if (!wants(*configuration, event, subject)) {
    ++_droppedByConfiguration;
    return Offer::notWanted;
  }
  deliver(event);
  return Offer::delivered;
}

bool Session::answer(const sources::SourceEvent& event) {
  const std::lock_guard lock(_deliveryMutex);
  if (!_on) return false;
  deliver(event);
  return true;
}

void Session::pass(Offer missed) {
  if (missed == Offer::off) ++_droppedWhileOff;
  if (missed == Offer::unconfigured) ++_droppedByConfiguration;
}

SessionStatus Session::status() const {
  return {_clientName, application(), _on, _delivered, _droppedByConfiguration, _droppedWhileOff};
}

}  // namespace qel::service
