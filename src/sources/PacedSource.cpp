#include "sources/PacedSource.h"

#include <stop_token>
#include <utility>

#include "sources/Pacer.h"

namespace qel::sources {

struct PacedSource::Run {
  Run(std::unique_ptr<EventSequence> events, WaitClock& clock, double speed)
      : sequence(std::move(events)), pacer(clock, speed) {}

  struct Next {
    std::optional<SourceEvent> event;
    bool beginsAnew = false;
  };
  Next next() {
    const std::lock_guard lock(mutex);
    auto event = sequence->next();
    return {std::move(event), sequence->beginsAnew()};
  }
  void passed(const SourceEvent& event) {
    const std::lock_guard lock(mutex);
    sequence->passed(event);
  }
  SourceAnswer query(std::uint32_t metric) {
    const std::lock_guard lock(mutex);
    return sequence->query(metric);
  }
  SourceFacts facts() {
    const std::lock_guard lock(mutex);
    return sequence->facts();
  }
  SourceCondition condition() {
    const std::lock_guard lock(mutex);
    return sequence->condition();
  }

  std::stop_source stop;
  std::weak_ptr<EventReceiver> receiver;
  std::shared_ptr<ListenerSignal> listeners;
  std::mutex mutex;  // guards the sequence
  std::unique_ptr<EventSequence> sequence;
  Pacer pacer;
};

PacedSource::PacedSource(std::string description, MakeSequence makeSequence, double speed,
                         WaitClock& clock)
    : _description(std::move(description)),
      _makeSequence(std::move(makeSequence)),
      _speed(speed),
      _clock(clock) {}

PacedSource::~PacedSource() { stop(); }

void PacedSource::start(std::weak_ptr<EventReceiver> receiver,
                        std::shared_ptr<ListenerSignal> listeners) {
  stop();
  auto run = std::make_shared<Run>(_makeSequence(), _clock, _speed);
  run->receiver = std::move(receiver);
  run->listeners = std::move(listeners);
  const std::lock_guard lock(_mutex);
  _run = run;
  _threads.start([run] { play(*run); });
}

void PacedSource::stop() {
  const std::lock_guard lock(_mutex);
  if (_run) _run->stop.request_stop();
  _run.reset();
}

std::shared_ptr<PacedSource::Run> PacedSource::run() const {
  const std::lock_guard lock(_mutex);
  return _run;
}

SourceAnswer PacedSource::query(std::uint32_t metric) {
  const auto now = run();
  if (!now) return {false, "the source is not running", 0, {}};
  return now->query(metric);
}

SourceFacts PacedSource::facts() const {
  const auto now = run();
  return now ? now->facts() : SourceFacts();
}

void PacedSource::play(Run& run) {
  const std::stop_token stop = run.stop.get_token();
  // Once stopped, nothing is touched any more but the run: the source, its clock and the whole
  // process may be on their way out.
  report(run);
  while (!stop.stop_requested()) {
    const auto [event, beginsAnew] = run.next();
    if (!event) return report(run);
    if (beginsAnew && !run.pacer.beginRound(stop)) return;
    if (!run.pacer.wait(event->timeMs, stop)) return;
    run.passed(*event);
    if (!hand(run, *event)) return;
  }
}

void PacedSource::report(Run& run) {
  if (run.stop.stop_requested()) return;
  const SourceCondition condition = run.condition();
  if (const auto receiver = run.receiver.lock()) receiver->conditionChanged(condition);
}

// Until someone took the event. False when stopped or nobody is left.
bool PacedSource::hand(Run& run, const SourceEvent& event) {
  const std::stop_token stop = run.stop.get_token();
  while (!stop.stop_requested()) {
    const std::uint64_t generation = run.listeners->generation();
    {
      // Held no longer than this: letting go may be the end of the receiver and of the source.
      const auto receiver = run.receiver.lock();
      if (!receiver) return false;
      if (receiver->take(event) == EventReceiver::Taken::yes) return true;
    }
    run.pacer.resume();
    if (!run.listeners->waitPast(generation, stop)) return false;
  }
  return false;
}

}  // namespace qel::sources
