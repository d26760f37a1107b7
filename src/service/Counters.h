// What the service has counted, for its status.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace qel::service {

struct SessionStatus {
  std::string clientName;
  std::optional<std::int64_t> application;  // of its last command
  bool eventsOn = false;
  std::uint64_t delivered = 0;
  std::uint64_t droppedByConfiguration = 0;  // not asked for, or sooner than the period allows
  std::uint64_t droppedWhileOff = 0;
};

struct CoreStatus {
  std::string source;
  bool sourceRunning = false;
  std::uint64_t received = 0;                // events taken from the source
  std::uint64_t delivered = 0;               // to sessions, each counted; answers to queries too
  std::uint64_t undecodable = 0;             // of those received: not delivered to anyone
  std::uint64_t withoutContent = 0;          // likewise: reports that no table could draw
  std::uint64_t droppedByConfiguration = 0;  // deliveries that a configuration kept back
  std::uint64_t droppedWhileOff = 0;
  std::uint64_t commands = 0;
  std::uint64_t refusedCommands = 0;
  std::vector<SessionStatus> sessions;  // those open
};

}  // namespace qel::service
