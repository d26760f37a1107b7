#include "sources/combined/CombinedSource.h"

#include <condition_variable>
#include <utility>
#include <vector>

#include "sources/combined/CombinedCondition.h"
#include "sources/combined/MetricArbiter.h"

namespace qel::sources {

// From a start to its stop.
class CombinedSource::Run {
 public:
  Run(std::weak_ptr<EventReceiver> receiver, std::weak_ptr<EventSource> port,
      std::weak_ptr<EventSource> manager, bool isPortMissed)
      : _receiver(std::move(receiver)),
        _portSource(std::move(port)),
        _managerSource(std::move(manager)),
        _isPortMissed(isPortMissed) {}

  void stop() {
    {
      const std::lock_guard lock(_mutex);
      _stopped = true;
    }
    _turn.notify_all();
  }

  EventReceiver::Taken take(SourcePart part, const SourceEvent& event) {
    if (!beginTurn()) return EventReceiver::Taken::yes;
    EventReceiver::Taken taken = EventReceiver::Taken::yes;
    if (lets(part, event)) taken = hand(event);
    endTurn();
    return taken;
  }

  void noteCondition(SourcePart part, const SourceCondition& condition) {
    if (!beginTurn()) return;
    const Change change = noted(part, condition);
    for (const SourceEvent& event : change.instead) {
      if (isStillKnown(otherThan(part), event)) hand(event);
    }
    if (const auto receiver = _receiver.lock()) receiver->conditionChanged(change.condition);
    endTurn();
  }

 private:
  struct Change {
    std::vector<SourceEvent> instead;
    SourceCondition condition;
  };

  // One source at a time goes to the receiver. False when stopped: nobody waits for a turn whose
  // owner may be ending the sources.
  bool beginTurn() {
    std::unique_lock lock(_mutex);
    _turn.wait(lock, [this] { return !_isTaken || _stopped; });
    if (_stopped) return false;
    return _isTaken = true;
  }
  void endTurn() {
    {
      const std::lock_guard lock(_mutex);
      _isTaken = false;
    }
    _turn.notify_all();
  }

  bool lets(SourcePart part, const SourceEvent& event) {
    {
      const std::lock_guard lock(_mutex);
      if (_arbiter.lets(part, event)) return true;
    }
    // The better one may have lost this metric alone.
    if (isStillKnown(otherThan(part), event)) return false;
    const std::lock_guard lock(_mutex);
    _arbiter.release(*metricOf(event));
    return true;
  }

  // A source that is being destroyed is not to be replaced.
  bool isStillKnown(SourcePart part, const SourceEvent& event) const {
    const auto source = (part == SourcePart::port ? _portSource : _managerSource).lock();
    return !source || source->query(*metricOf(event)).known;
  }

  Change noted(SourcePart part, const SourceCondition& condition) {
    const std::lock_guard lock(_mutex);
    SourceCondition& known = part == SourcePart::port ? _port : _manager;
    const bool isLost = isThere(known) && !isThere(condition);
    known = condition;
    return {isLost ? _arbiter.lose(part) : std::vector<SourceEvent>(),
            combinedCondition(_port, _manager, _isPortMissed)};
  }

  EventReceiver::Taken hand(const SourceEvent& event) {
    // Held no longer than this: letting go may be the end of the receiver and of the source.
    const auto receiver = _receiver.lock();
    return receiver ? receiver->take(event) : EventReceiver::Taken::yes;
  }

  const std::weak_ptr<EventReceiver> _receiver;
  const std::weak_ptr<EventSource> _portSource;
  const std::weak_ptr<EventSource> _managerSource;
  const bool _isPortMissed;
  std::mutex _mutex;  // guards all that follows; the receiver is not called under it
  std::condition_variable _turn;
  bool _isTaken = false;
  bool _stopped = false;
  MetricArbiter _arbiter;
  SourceCondition _port;
  SourceCondition _manager;
};

// Listens to one of the two.
class CombinedSource::Ear final : public EventReceiver {
 public:
  Ear(std::shared_ptr<Run> run, SourcePart part) : _run(std::move(run)), _part(part) {}

  Taken take(const SourceEvent& event) override { return _run->take(_part, event); }
  void conditionChanged(const SourceCondition& condition) override {
    _run->noteCondition(_part, condition);
  }

 private:
  const std::shared_ptr<Run> _run;
  const SourcePart _part;
};

CombinedSource::CombinedSource(std::shared_ptr<EventSource> port,
                               std::shared_ptr<EventSource> manager, Port wish)
    : _port(std::move(port)), _manager(std::move(manager)), _wish(wish) {}

CombinedSource::~CombinedSource() { stop(); }

void CombinedSource::start(std::weak_ptr<EventReceiver> receiver,
                           std::shared_ptr<ListenerSignal> listeners) {
  stop();
  auto run = std::make_shared<Run>(std::move(receiver), _port, _manager, _wish == Port::missed);
  auto portEar = std::make_shared<Ear>(run, SourcePart::port);
  auto managerEar = std::make_shared<Ear>(run, SourcePart::manager);
  {
    const std::lock_guard lock(_mutex);
    _run = run;
    _portEar = portEar;
    _managerEar = managerEar;
  }
  _port->start(portEar, listeners);
  _manager->start(managerEar, listeners);
}

void CombinedSource::stop() {
  std::shared_ptr<Run> run;
  std::shared_ptr<Ear> portEar;
  std::shared_ptr<Ear> managerEar;
  {
    const std::lock_guard lock(_mutex);
    run.swap(_run);
    portEar.swap(_portEar);
    managerEar.swap(_managerEar);
  }
  if (!run) return;
  run->stop();
  _port->stop();
  _manager->stop();
}

SourceAnswer CombinedSource::query(std::uint32_t metric) {
  const bool isPortFirst = betterPart(metric) == SourcePart::port;
  SourceAnswer answer = (isPortFirst ? _port : _manager)->query(metric);
  return answer.known ? answer : (isPortFirst ? _manager : _port)->query(metric);
}

SourceFacts CombinedSource::facts() const {
  SourceFacts facts = _port->facts();
  SourceFacts more = _manager->facts();
  for (auto& row : more.rows) facts.rows.push_back(std::move(row));
  return facts;
}

std::string CombinedSource::description() const {
  return _port->description() + ", and " + _manager->description();
}

}  // namespace qel::sources
