// The payloads of a busy phone: the same ones at every run.
#pragma once

#include <cstdint>
#include <vector>

#include "base/Bytes.h"

namespace qel::bench {

struct Payload {
  std::uint32_t metric;  // catalogue identifier
  Bytes bytes;
};

// When the mix begins, in milliseconds since 1970-01-01 00:00 UTC, and from payload to payload.
inline constexpr std::uint64_t kMixStartMs = 1500000000000;
inline constexpr std::uint64_t kMixStepMs = 40;

// Mostly LTE signal, transmit power, neighbours and RRC states, with what else a phone reports now
// and then; about 64 bytes each.
std::vector<Payload> phoneMix(std::size_t count);

double meanSize(const std::vector<Payload>& payloads);

}  // namespace qel::bench
