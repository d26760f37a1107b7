// The service on one bus connection.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/WakeUp.h"
#include "service/ServiceCore.h"
#include "service/bus/BusClient.h"
#include "service/bus/CallFilter.h"
#include "service/bus/CallQueue.h"
#include "service/bus/ChangedProperties.h"
#include "service/bus/QueuedObject.h"
#include "service/bus/ReadBudget.h"
#include "tesk/bus/BasebandManager1Adaptor.h"
#include "tesk/bus/BusAddress.h"

namespace qel::service {

// The object on the bus, there before the adaptor that registers itself with it.
struct FrontObject {
  QueuedObject object;
};

// Belongs to one thread. Lives as long as the bus connection: every call may throw sdbus::Error
// when that is lost, and with the front go all its clients.
//
// No caller can keep others waiting for long. Calls are taken off the bus quickly, looked at, and
// wait here; then callers are answered in turn. Either goes on for a few milliseconds before
// streams, signals and the stop descriptor have their turn. When the bus does not take the answers,
// no more calls are taken.
class BusFront final : private FrontObject, public tesk::BasebandManager1_adaptor {
 public:
  // Takes the service's name on the connection, which outlives the front. Throws sdbus::Error when
  // somebody else has it or may have it.
  BusFront(sdbus::IConnection& connection, std::shared_ptr<ServiceCore> core);
  ~BusFront();
  BusFront(const BusFront&) = delete;
  BusFront& operator=(const BusFront&) = delete;

  // Waits for the bus, the clients or `stopDescriptor`, and does what is due.
  void waitAndProcess(int stopDescriptor);

 private:
  // What the counters were when their change was last noted.
  struct Counted {
    std::uint64_t received = 0;
    std::uint64_t delivered = 0;
    std::uint64_t dropped = 0;
    std::uint64_t undecodable = 0;
    std::uint64_t withoutContent = 0;
    friend bool operator==(const Counted&, const Counted&) = default;
  };

  sdbus::UnixFd Register(const std::string& clientName) override;
  void SetDelivery(const bool& on) override;
  std::tuple<std::int32_t, std::string, std::map<std::string, sdbus::Variant>> PerformCommand(
      const std::string& command, const std::map<std::string, sdbus::Variant>& request) override;

  std::string Version() override;
  std::string Source() override;
  bool SourceRunning() override;
  std::map<std::string, sdbus::Variant> Condition() override;
  std::vector<sdbus::Struct<std::string, std::string>> SourceFacts() override;
  std::map<std::int64_t, std::uint32_t> Configurations() override;
  std::vector<sdbus::Struct<std::string, bool, std::uint64_t, std::uint64_t>> Clients() override;
  std::uint64_t EventsReceived() override;
  std::uint64_t EventsDelivered() override;
  std::uint64_t EventsDropped() override;
  std::uint64_t EventsUndecodable() override;
  std::uint64_t EventsWithoutContent() override;

  void arrived(const std::string& method, const sdbus::MethodCall& call,
               const sdbus::method_callback& answer);
  void answerCall(const sdbus::MethodCall& call, const sdbus::method_callback& answer);
  void takeCalls();
  void answerCalls();
  bool isBusBehind() const;

  BusClient& callingClient();
  void noteRegistration();
  void noteOwnerChange(sdbus::Message& signal);
  void forget(const std::string& busName);
  void noteCondition();
  int timeout(const sdbus::IConnection::PollData& bus) const;
  void serveStreams(const std::vector<short>& happened);

  const CoreStatus& status() const;
  Counted counted() const;
  void noteCounters();
  void signalChanges();

  sdbus::IConnection& _connection;
  const std::shared_ptr<ServiceCore> _core;
  const std::shared_ptr<WakeUp> _wakeUp = std::make_shared<WakeUp>();
  const std::shared_ptr<Backlogs> _backlogs = std::make_shared<Backlogs>();
  std::map<std::string, std::unique_ptr<BusClient>> _clients;  // by the caller's bus name
  std::vector<std::string> _vanished;
  sdbus::Slot _ownerWatch;
  CallQueue _calls;
  ReadBudget _reads;
  bool _isRead = false;  // what is being taken off the bus now is answered at once
  std::optional<CallFilter> _filter;
  std::string _caller;  // of the call that is being answered
  struct Registrations {
    std::chrono::steady_clock::time_point since;
    int count = 0;
  };
  std::map<std::string, Registrations> _registrations;  // of late, by the caller's bus name
  ChangedProperties _changed;
  mutable std::optional<CoreStatus> _status;  // as of this turn
  std::uint64_t _droppedOfGone = 0;
  Counted _noted;
  std::chrono::steady_clock::time_point _notedAt;
  sources::SourceCondition _notedCondition;
};

}  // namespace qel::service
