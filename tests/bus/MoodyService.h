// A service on the bus that answers, refuses or says nothing, as told.
#pragma once

#include <sdbus-c++/sdbus-c++.h>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "support/PrivateBus.h"

namespace qel::testing {

// Has the service's name while it lives, and a thread of its own. Sends no events by itself.
class MoodyService {
 public:
  enum class Mood { answers, refuses, saysNothing, isBusy };

  MoodyService(const PrivateBus& bus, Mood atRegistration, Mood atCommands);
  ~MoodyService();
  MoodyService(const MoodyService&) = delete;
  MoodyService& operator=(const MoodyService&) = delete;

  // From now on. What it has said nothing to so far it answers as soon as it answers at all.
  void setMoods(Mood atRegistration, Mood atCommands);

  // What it says of its modem from now on, to whoever asks.
  void setCondition(std::string text);

  // To everybody who registered, whatever they asked for.
  void send(const qel::Bytes& packet) const;

  // Of the commands that it took, in their order.
  std::vector<std::string> commands() const;
  int registrations() const;
  // Calls that it was too busy for.
  int refusals() const;
  bool delivers() const;

 private:
  using Entries = std::map<std::string, sdbus::Variant>;
  using Registration = sdbus::Result<sdbus::UnixFd>;
  using Command = sdbus::Result<std::int32_t, std::string, Entries>;

  bool isTooBusy(Mood mood);
  void take(Registration registration);
  void take(Command command);
  static sdbus::UnixFd streamTo(std::vector<sdbus::UnixFd>& kept);

  std::unique_ptr<sdbus::IConnection> _connection;  // outlives what it has to answer
  std::unique_ptr<sdbus::IObject> _object;
  // Not held while anything is answered: the bus library calls us with a lock of its own held.
  mutable std::mutex _mutex;
  Mood _atRegistration;
  Mood _atCommands;
  std::vector<Registration> _unregistered;
  std::vector<Command> _unanswered;
  std::vector<std::string> _commands;
  std::vector<sdbus::UnixFd> _streams;
  int _registrations = 0;
  int _refusals = 0;
  std::string _condition;
  bool _delivers = false;
};

}  // namespace qel::testing
