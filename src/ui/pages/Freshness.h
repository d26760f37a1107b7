// Where the values come from and how that is doing, in words.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "base/TimeZone.h"
#include "history/Viewpoint.h"
#include "ui/pages/Feed.h"

namespace qel {

struct Freshness {
  std::string source;  // "Simulated modem", "Recording drive.jsonl, ended", "Modem EG25-G"
  std::string state;   // "connected", "connected, but no reports since 20:21", "not reachable …"
  std::string advice;  // what to do next; empty: nothing need be done
  std::string loss;    // "3 reports left out, …"; empty: none was
  bool isFlowing = false;  // reports come; else the state is worth a notice
  std::string bar;         // for the bar: the state while nothing flows, else empty
  std::string footer;      // for the first screen: all of it, one thing a line
  std::string spoken;

  // When it will read differently though nothing happens; none: never.
  std::optional<std::uint64_t> changesAtMs;

  friend bool operator==(const Freshness&, const Freshness&) = default;
};

Freshness freshness(const Feed& feed, const Viewpoint& viewpoint,
                    const TimeZone& zone = systemTimeZone());

}  // namespace qel
