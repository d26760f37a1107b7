// What the user and the network want of the phone, over time.
#pragma once

#include <cstdint>

#include "sources/simulated/Random.h"

namespace qel::sources {

enum class Purpose : std::uint8_t { none, signalling, data, call };

struct Demand {
  Purpose purpose = Purpose::none;
  bool fromNetwork = false;  // a page or an incoming call
};

// Pages and messages of some seconds with pauses between, and a call about every minute. The first
// page comes at once, so that a drive begins with something to see.
class Traffic {
 public:
  Traffic(std::uint64_t seed, std::uint64_t startMs);

  // Time must not go back.
  Demand at(std::uint64_t timeMs, double carM);

 private:
  struct Session {
    std::uint64_t beginMs;
    std::uint64_t endMs;
    bool fromNetwork;
  };
  Session nextPage(std::uint64_t afterMs);
  Session nextCall(std::uint64_t afterMs);

  Random _random;
  Session _page;
  Session _call;
};

}  // namespace qel::sources
