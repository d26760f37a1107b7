// One run of a source on a diagnostics port, from its start to its end.
#pragma once

#include <atomic>
#include <chrono>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>

#include "base/WakeUp.h"
#include "sources/diagnostics/DiagnosticsFacts.h"
#include "sources/diagnostics/DiagnosticsSource.h"
#include "sources/diagnostics/LiveMetrics.h"
#include "sources/diagnostics/port/PortFinder.h"

namespace qel::diagnostics {

// play() is the thread's; the other operations may be called by any.
class DiagnosticsSource::Run {
 public:
  Run(const DiagnosticsChoice& choice, const DiagnosticsWorld& world,
      const DiagnosticsTiming& timing, std::weak_ptr<sources::EventReceiver> receiver,
      std::shared_ptr<sources::ListenerSignal> listeners);

  void play();
  void stop();

  const WakeUp& wakeUp() const { return _wakeUp; }
  sources::SourceAnswer query(std::uint32_t metric) const { return _metrics.query(metric); }
  sources::SourceFacts facts() const;
  std::string modem() const;

 private:
  using Clock = std::chrono::steady_clock;

  // Whether logs came to be on.
  bool live(DiagPort& port);
  void turn(DiagPort& port, DiagnosticsSession& session);
  bool waitForPorts(PortFinder& finder, Clock::time_point end);
  void wait(const DiagPort& port, const DiagnosticsSession& session);
  void noticeListeners();
  void noticeSleep(DiagnosticsSession& session);
  void hand(const sources::SourceEvent& event);
  void report(const sources::SourceCondition& condition);
  void say(const std::string& line);
  void rest(std::chrono::milliseconds pause);
  void noteFacts(const DiagPort& port, const DiagnosticsSession& session);

  const DiagnosticsWorld _world;
  const DiagnosticsTiming _timing;
  const std::weak_ptr<sources::EventReceiver> _receiver;
  const std::shared_ptr<sources::ListenerSignal> _listeners;
  const WakeUp _wakeUp;  // for the end and for new listeners
  std::atomic<bool> _stopping = false;
  LiveMetrics _metrics;

  mutable std::mutex _factsMutex;  // guards the two below
  PortFacts _facts;
  ByteRate _rate;

  // The thread only.
  const std::string _wish;
  const bool _isMissed;
  std::uint64_t _generation;
  bool _anyoneListens = true;  // until an event goes nowhere
  bool _readable = false;
  std::chrono::milliseconds _slept{0};
  Clock::time_point _endAt;
  sources::SourceCondition _reported;
  std::string _said;
};

}  // namespace qel::diagnostics
