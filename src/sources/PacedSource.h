// A source that plays a sequence of events at the pace of a clock.
#pragma once

#include <functional>
#include <memory>
#include <mutex>
#include <string>

#include "sources/EventSequence.h"
#include "sources/EventSource.h"
#include "sources/RunThreads.h"
#include "sources/WaitClock.h"

namespace qel::sources {

// Each start plays a new sequence. While nobody listens time stands still: the event waits and goes
// to the next listener.
//
// A run's thread owns what it works with, so that the source may be stopped and even destroyed from
// within an event of its own; from any other thread the destructor waits for the run to end.
class PacedSource final : public EventSource {
 public:
  using MakeSequence = std::function<std::unique_ptr<EventSequence>()>;

  // `clock` outlives the source and its threads.
  PacedSource(std::string description, MakeSequence makeSequence, double speed,
              WaitClock& clock = steadyWaitClock());
  ~PacedSource() override;

  void start(std::weak_ptr<EventReceiver> receiver,
             std::shared_ptr<ListenerSignal> listeners) override;
  void stop() override;
  SourceAnswer query(std::uint32_t metric) override;
  std::string description() const override { return _description; }
  SourceFacts facts() const override;

 private:
  struct Run;
  std::shared_ptr<Run> run() const;
  static void play(Run& run);
  static bool hand(Run& run, const SourceEvent& event);
  static void report(Run& run);

  const std::string _description;
  const MakeSequence _makeSequence;
  const double _speed;
  WaitClock& _clock;

  mutable std::mutex _mutex;  // guards the two below; no event and no query runs under it
  std::shared_ptr<Run> _run;
  RunThreads _threads;  // last: they end first
};

}  // namespace qel::sources
