// One bus connection of a client: its registration with the service and its event stream.
#pragma once

#include <sdbus-c++/sdbus-c++.h>
#include <chrono>
#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "tesk/Transport.h"
#include "tesk/bus/BusAddress.h"
#include "tesk/bus/ConditionWatch.h"
#include "tesk/bus/EventRest.h"

namespace tesk::bus {

// Belongs to one thread and never waits for the service: what it asks is answered in
// waitAndProcess. Lives as long as the bus connection; waitAndProcess throws sdbus::Error when that
// is lost, and the link is then of no more use.
class BusLink {
 public:
  using Clock = std::chrono::steady_clock;

  // A command on its way. It is answered exactly once, at the latest by the link's end, unless it
  // was abandoned before it was sent: then it never is.
  struct Command {
    std::string name;
    Message request;
    std::function<void(CommandResult result, Message reply)> answer;
    std::function<bool()> isAbandoned;
  };

  struct Reachability {
    bool reachable;
    std::string why;  // when not
  };

  // Connects, which may take as long as the bus pleases, and begins to register. Events may come
  // together after a rest.
  BusLink(const BusAddress& address, std::string clientName, EventSink sink, bool deliver,
          ConditionObserver conditionObserver, std::chrono::milliseconds rest = {});
  ~BusLink();
  BusLink(const BusLink&) = delete;
  BusLink& operator=(const BusLink&) = delete;

  // Nothing while the first answer is still awaited.
  std::optional<Reachability> reachability() const;

  void setDelivery(bool on);
  // Waits for a registration that is under way, and is sent again if the service is too busy to
  // take it. A command that the service has takes as long as the service does: its answer is what
  // it came to.
  void performCommand(Command command);

  // Waits for the bus, the stream or `wakeDescriptor`, and takes what came. Whether the descriptor
  // has something to say.
  bool waitAndProcess(int wakeDescriptor);

 private:
  struct Sent {
    Clock::time_point at;
    Command command;
  };
  using CommandReply = std::tuple<std::int32_t, std::string, std::map<std::string, sdbus::Variant>>;

  bool isAttached() const { return _stream.isValid(); }
  bool isOverdue(Clock::time_point now) const;
  void watchOwner();
  void beginToRegister();
  void registered(const sdbus::Error* error, const sdbus::UnixFd& stream);
  void failed(const sdbus::Error& error);
  void askForDelivery();
  void send(Command command);
  void answered(std::uint64_t number, const sdbus::Error* error, CommandReply reply);
  void processBus();
  void processStream();
  std::size_t readEvents();
  // The service has taken a call, or has refused one that is to be made again.
  void becomeIdle();
  void becomeBusy();
  void tryAgain();
  // The registration is over, and what was sent under it comes to nothing.
  void detach(std::string_view why);
  void tryAgainLater(std::chrono::milliseconds longestPause);
  int timeout(const sdbus::IConnection::PollData& bus) const;

  const std::string _clientName;
  const EventSink _sink;
  const std::unique_ptr<sdbus::IConnection> _connection;
  sdbus::Slot _ownerMatch;
  std::unique_ptr<sdbus::IProxy> _proxy;
  ConditionWatch _condition;
  sdbus::UnixFd _stream;
  EventRest _rest;
  std::optional<Clock::time_point> _restsUntil;
  bool _deliver;
  bool _ownerChanged = false;
  bool _busy = false;  // refused the last call, and none was taken since

  bool _registering = false;
  std::uint64_t _registration = 0;  // its number: answers under an earlier one are void
  Clock::time_point _attachedAt;
  std::optional<Clock::time_point> _tryAgainAt;
  std::chrono::milliseconds _pause;
  std::optional<std::string> _why;  // none before the first answer

  std::deque<Command> _waiting;         // for the registration, or a service that was busy
  std::map<std::uint64_t, Sent> _sent;  // not answered yet, by number
  std::uint64_t _lastNumber = 0;
};

}  // namespace tesk::bus
