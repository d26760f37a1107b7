// The baseband manager service without its front: sessions, configurations, routing and commands.
#pragma once

#include <array>
#include <atomic>
#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "base/Clock.h"
#include "service/ConditionBook.h"
#include "service/ConfigurationStore.h"
#include "service/Counters.h"
#include "service/KeptBook.h"
#include "service/Session.h"
#include "service/UndecodableLog.h"
#include "sources/EventSource.h"
#include "tesk/Transport.h"

namespace qel::service {

// Shared by its fronts and their sessions. Every call may come from any thread, also from a sink.
// The core's lock guards the list of sessions and whether the source runs; no sink, no session and
// no query runs under it. The source runs from the first session that switches events on until the
// last session closes.
class ServiceCore final : public sources::EventReceiver,
                          public std::enable_shared_from_this<ServiceCore> {
 public:
  // Both clocks outlive the core: one spaces out log lines and tells when a client was there last,
  // the other spaces out what is written. With a keeper, configurations and whose they are outlive
  // the core.
  static std::shared_ptr<ServiceCore> create(
      std::unique_ptr<sources::EventSource> source, const Clock& clock = systemClock(),
      std::unique_ptr<StateKeeper> keeper = nullptr,
      sources::WaitClock& waitClock = sources::steadyWaitClock());
  ~ServiceCore() override;

  // A session starts with events off. A client that comes back under the same name belongs to the
  // application of its last command.
  std::shared_ptr<Session> open(std::string_view clientName, tesk::EventSink sink);
  // After it returned, the session's sink is not called any more.
  void close(const std::shared_ptr<Session>& session);

  void eventsOn(Session& session);
  // After it returned, no event is in flight to the session.
  void eventsOff(Session& session);

  // Never throws; a request that cannot be met is answered with a code and one line that names the
  // key at fault. A query's metric is delivered to the session before its result is returned.
  tesk::CommandResult performCommand(Session& session, std::string_view command,
                                     const tesk::Message& request);

  CoreStatus status() const;
  // Application identifiers with a configuration and the number of metrics that each asks for.
  std::map<std::int64_t, std::uint32_t> configurationSizes() const {
    return _configurations.sizes();
  }

  // What the source knows about where its events come from.
  sources::SourceFacts facts() const { return _source->facts(); }

  // How it is with the modem behind the source; nothing is known of it while the source rests.
  ConditionBook& condition() { return _condition; }

  // EventReceiver, for the source.
  Taken take(const sources::SourceEvent& event) override;
  void conditionChanged(const sources::SourceCondition& condition) override;

 private:
  using Handler = tesk::CommandResult (ServiceCore::*)(Session&, const Dictionary&);
  struct Command {
    std::string_view name;
    Handler handler;
  };
  static const std::array<Command, 3> kCommands;

  // Never changed, only replaced: an event goes to those that it found.
  using Sessions = std::vector<std::shared_ptr<Session>>;

  ServiceCore(std::unique_ptr<sources::EventSource> source, const Clock& clock,
              std::unique_ptr<StateKeeper> keeper, sources::WaitClock& waitClock);

  tesk::CommandResult addConfiguration(Session& session, const Dictionary& request);
  tesk::CommandResult clearConfiguration(Session& session, const Dictionary& request);
  tesk::CommandResult queryMetric(Session& session, const Dictionary& request);
  // From now on the session is of this application.
  void join(Session& session, std::int64_t application);
  std::optional<EventSubject> examine(const sources::SourceEvent& event, EventFault& fault);
  void noteTagLines(std::size_t lines);
  std::shared_ptr<const Sessions> sessions() const;

  ConfigurationStore _configurations;
  const std::shared_ptr<sources::ListenerSignal> _listeners =
      std::make_shared<sources::ListenerSignal>();
  UndecodableLog _undecodableLog;
  UndecodableLog _tagLog;
  ConditionBook _condition;
  KeptBook _book;

  mutable std::mutex _mutex;
  std::shared_ptr<const Sessions> _sessions = std::make_shared<Sessions>();  // those open
  bool _sourceRunning = false;

  std::atomic<std::uint64_t> _received = 0;
  std::atomic<std::uint64_t> _delivered = 0;
  std::atomic<std::uint64_t> _undecodable = 0;
  std::atomic<std::uint64_t> _withoutContent = 0;
  std::atomic<std::uint64_t> _droppedByConfiguration = 0;
  std::atomic<std::uint64_t> _droppedWhileOff = 0;
  std::atomic<std::uint64_t> _commands = 0;
  std::atomic<std::uint64_t> _refusedCommands = 0;

  // Last: gone before anything that its events might need.
  const std::unique_ptr<sources::EventSource> _source;
};

}  // namespace qel::service
