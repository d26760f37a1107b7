// One bus connection of a client: its registration with the service and its event stream.
#pragma once

#include <sdbus-c++/sdbus-c++.h>
#include <chrono>
#include <memory>
#include <optional>
#include <string>

#include "tesk/Transport.h"
#include "tesk/bus/BusAddress.h"

namespace tesk::bus {

class ManagerProxy;

// Belongs to one thread. Lives as long as the bus connection; every call may throw sdbus::Error
// when that is lost, and the link is then of no more use.
class BusLink {
 public:
  using Clock = std::chrono::steady_clock;

  BusLink(const BusAddress& address, std::string clientName, EventSink sink);
  ~BusLink();

  // Registers with the service, unless that is done. False when it cannot be had now; why() tells.
  bool attach();
  bool isAttached() const { return _stream.isValid(); }
  const std::string& why() const { return _why; }

  void setDelivery(bool on);
  CommandResult performCommand(std::string_view command, const Message& request, Message& reply);

  // Waits for the bus, the stream or `wakeDescriptor`, and takes what came.
  void waitAndProcess(int wakeDescriptor);

 private:
  void watchOwner();
  void processBus();
  void processStream();
  void detach(std::string why);
  int pollTimeout(const sdbus::IConnection::PollData& bus) const;

  const std::string _clientName;
  const EventSink _sink;
  const std::unique_ptr<sdbus::IConnection> _connection;
  sdbus::Slot _ownerMatch;
  std::unique_ptr<ManagerProxy> _proxy;
  sdbus::UnixFd _stream;
  bool _deliver = false;
  bool _ownerChanged = false;
  std::optional<Clock::time_point> _tryAgainAt;
  std::string _why = "baseband manager service not reachable";
};

}  // namespace tesk::bus
