// What the baseband manager service says about itself.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "tesk/bus/BusAddress.h"

namespace tesk::bus {

struct ClientStatus {
  std::string name;
  bool eventsOn = false;
  std::uint64_t delivered = 0;
  std::uint64_t dropped = 0;  // because the client did not read
};

// How it is with the modem or the recording behind the source. What is empty is not known.
struct ConditionStatus {
  std::string state;   // one word
  std::string text;    // one line for people
  std::string reason;  // in that line too
  std::string model;   // of the modem
  std::string driver;
};

// A row of what the source knows about where its events come from.
struct FactStatus {
  std::string name;
  std::string value;
};

struct ServiceStatus {
  std::string version;
  std::string source;
  bool sourceRunning = false;
  ConditionStatus condition;
  std::vector<FactStatus> facts;
  std::map<std::int64_t, std::uint32_t> configurations;  // metrics asked for, by application
  std::vector<ClientStatus> clients;
  std::uint64_t eventsReceived = 0;
  std::uint64_t eventsDelivered = 0;  // each client counted
  std::uint64_t eventsDropped = 0;
  std::uint64_t eventsUndecodable = 0;
  std::uint64_t eventsWithoutContent = 0;
};

// Asks once, over a connection of its own, and waits a few seconds at most for the answer. Any
// thread. Nothing when the service is not there; `why` is then one line.
std::optional<ServiceStatus> readServiceStatus(const BusAddress& address, std::string& why);

}  // namespace tesk::bus
