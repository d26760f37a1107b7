// The metrics of a real modem, from its diagnostics port.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <mutex>
#include <string>

#include "base/TimeAsleep.h"
#include "sources/EventSource.h"
#include "sources/RunThreads.h"
#include "sources/diagnostics/DiagnosticsChoice.h"
#include "sources/diagnostics/port/PortSearch.h"
#include "sources/diagnostics/session/DiagnosticsSession.h"

namespace qel::diagnostics {

struct DiagnosticsTiming {
  std::chrono::milliseconds period{5000};  // from report to report of a metric that stays
  std::chrono::milliseconds firstPause{250};
  std::chrono::milliseconds longestPause{10000};
  // Where there is no port, and the system tells of one that comes.
  std::chrono::milliseconds longestPauseWhenTold() const { return 6 * longestPause; }
  std::chrono::milliseconds ending{500};  // the modem has that long to hear that logs are off
  SessionTiming session;
};

// What a test stands in for.
struct DiagnosticsWorld {
  std::function<std::unique_ptr<PortSearch>()> search = makeUdevPortSearch;
  std::function<std::chrono::milliseconds()> asleep = qel::timeAsleep;
};

// While it runs it has one thread with the port, which it finds again after the loss of port or
// modem; meanwhile no metric has a value. While nobody listens the modem's logs are off.
//
// A run's thread owns what it works with, so that the source may be stopped and even destroyed from
// within an event of its own; from any other thread the destructor waits for the run to end.
class DiagnosticsSource final : public sources::EventSource {
 public:
  explicit DiagnosticsSource(DiagnosticsChoice choice, DiagnosticsWorld world = {},
                             const DiagnosticsTiming& timing = {});
  ~DiagnosticsSource() override;

  void start(std::weak_ptr<sources::EventReceiver> receiver,
             std::shared_ptr<sources::ListenerSignal> listeners) override;
  void stop() override;
  sources::SourceAnswer query(std::uint32_t metric) override;
  std::string description() const override;
  sources::SourceFacts facts() const override;

  // The modem's own device in /sys, as ModemManager names it; empty while it is not known.
  std::string modem() const;

 private:
  class Run;

  std::shared_ptr<Run> run() const;

  const DiagnosticsChoice _choice;
  const DiagnosticsWorld _world;
  const DiagnosticsTiming _timing;

  mutable std::mutex _mutex;  // guards the two below; no event runs under it
  std::shared_ptr<Run> _run;
  sources::RunThreads _threads;  // last: they end first
};

}  // namespace qel::diagnostics
