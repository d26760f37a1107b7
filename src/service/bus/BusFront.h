// The service on one bus connection.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "service/ServiceCore.h"
#include "service/bus/BusClient.h"
#include "tesk/bus/BasebandManager1Adaptor.h"
#include "tesk/bus/BusAddress.h"
#include "tesk/bus/WakeUp.h"

namespace qel::service {

// Belongs to one thread. Lives as long as the bus connection: every call may throw sdbus::Error
// when that is lost, and with the front go all its clients.
class BusFront final : public sdbus::AdaptorInterfaces<tesk::BasebandManager1_adaptor> {
 public:
  // Takes the service's name on the connection, which outlives the front. Throws sdbus::Error when
  // somebody else has it or may have it.
  BusFront(sdbus::IConnection& connection, std::shared_ptr<ServiceCore> core);
  ~BusFront();

  // Waits for the bus, the clients or `stopDescriptor`, and does what is due.
  void waitAndProcess(int stopDescriptor);

 private:
  // What the counters were when their change was last signalled.
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
  std::map<std::int64_t, std::uint32_t> Configurations() override;
  std::vector<sdbus::Struct<std::string, bool, std::uint64_t, std::uint64_t>> Clients() override;
  std::uint64_t EventsReceived() override;
  std::uint64_t EventsDelivered() override;
  std::uint64_t EventsDropped() override;
  std::uint64_t EventsUndecodable() override;
  std::uint64_t EventsWithoutContent() override;

  std::string caller() const;
  BusClient& callingClient();
  void forget(const std::string& busName);
  void changed(const std::vector<std::string>& properties);
  Counted counted() const;
  void signalCounters();
  int pollTimeout(const sdbus::IConnection::PollData& bus) const;
  void serveStreams(const std::vector<short>& happened);

  sdbus::IConnection& _connection;
  const std::shared_ptr<ServiceCore> _core;
  const std::shared_ptr<tesk::bus::WakeUp> _wakeUp = std::make_shared<tesk::bus::WakeUp>();
  std::map<std::string, std::unique_ptr<BusClient>> _clients;  // by the caller's bus name
  std::vector<std::string> _vanished;
  std::uint64_t _droppedOfGone = 0;
  Counted _signalled;
  std::chrono::steady_clock::time_point _signalledAt;
};

}  // namespace qel::service
