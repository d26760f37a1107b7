// The head of the packets that carry a message of the non-access stratum in the clear.
#pragma once

#include <cstddef>

#include "sources/diagnostics/packets/Packet.h"

namespace qel::diagnostics {

// Its version, then the release of the standard and two numbers within.
struct PlainMessage {
  Outcome outcome = Outcome::damaged;
  ByteView bytes;
};

inline PlainMessage plainMessage(ByteView body) {
  constexpr std::uint8_t kVersion = 1;
  constexpr std::size_t kHead = 4;
  if (body.empty()) return {};
  if (body[0] != kVersion) return {Outcome::unknownVersion, {}};
  if (body.size() <= kHead) return {};
  return {Outcome::understood, body.subspan(kHead)};
}

}  // namespace qel::diagnostics
