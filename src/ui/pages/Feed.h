// What feeds a viewer, as whoever made its connection knows it.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace qel {

// A plain value; whoever owns the connection keeps it up to date. Times in milliseconds since
// 1970-01-01 00:00 UTC.
struct Feed {
  enum class Kind : std::uint8_t {
    service,    // the baseband manager service on a bus
    simulated,  // the others: a source within this process
    recording,
    rawLog,
    modem,
  };
  // Whether the service can be had, and why not.
  enum class Reach : std::uint8_t {
    unknown,  // nobody has answered yet
    there,
    notInstalled,
    notRunning,
    noPermission,
    noBus,
    tooManyClients,
    noAnswer,
    busy,
    refused,
  };

  Kind kind = Kind::service;
  std::string name;       // file without folder, or the modem's model; empty: there is none
  std::string state;      // one word about what stands behind it, such as "running" or "no-modem"
  std::string condition;  // the same in a line for people; empty: there is nothing to say
  std::string reason;     // the part of it that says why; empty: there is no more to say
  bool isWithoutModem = false;  // so it says
  Reach reach = Reach::there;
  std::optional<std::uint64_t> lostSinceMs;  // the service was there until then
  bool hasEnded = false;                     // a recording or raw log was read to its end
  std::optional<std::uint64_t> positionMs;   // in an opened recording, from its start
  std::optional<std::uint64_t> lengthMs;     // of it
  std::uint64_t dropped = 0;                 // events that came faster than they were taken

  friend bool operator==(const Feed&, const Feed&) = default;
};

}  // namespace qel
