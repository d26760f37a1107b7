// What is to be known about a diagnostics port by those who look for a fault.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>

#include "sources/SourceFacts.h"
#include "sources/diagnostics/PacketCounts.h"
#include "sources/diagnostics/port/FrameReader.h"
#include "sources/diagnostics/requests/Answers.h"

namespace qel::diagnostics {

// How many bytes a second came lately: within the last five to ten. One thread at a time.
class ByteRate {
 public:
  using Clock = std::chrono::steady_clock;

  // `bytes`: all since the port was opened. A smaller number than before begins anew.
  void note(std::uint64_t bytes, Clock::time_point now);
  std::uint64_t perSecond(Clock::time_point now) const;

 private:
  struct Mark {
    std::uint64_t bytes = 0;
    Clock::time_point at;
  };
  Mark _first, _middle, _last;
};

struct PortFacts {
  std::string port;   // empty: none is open
  std::string modem;  // its device in /sys
  std::optional<ModemVersion> version;
  std::optional<ModemBuild> build;
  FrameReader::Counts frames;
  std::uint64_t unwantedPackets = 0;
  std::uint64_t replacedMasks = 0;
  std::uint64_t bytesPerSecond = 0;
};

sources::SourceFacts factsOf(const PortFacts& port, const PacketCounts& counts);

}  // namespace qel::diagnostics
