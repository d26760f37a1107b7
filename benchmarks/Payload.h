// What the works are done on.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "base/Bytes.h"

namespace qel::bench {

struct Payload {
  std::uint32_t metric;  // catalogue identifier
  Bytes bytes;
};

struct Mix {
  std::string name;
  std::vector<Payload> payloads;
};

// When a drawn mix begins, in milliseconds since 1970-01-01 00:00 UTC, and from payload to payload.
inline constexpr std::uint64_t kMixStartMs = 1500000000000;
inline constexpr std::uint64_t kMixStepMs = 40;

}  // namespace qel::bench
