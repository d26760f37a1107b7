// Log packets that are made of parts: a byte 1, how many parts, two bytes 0; then each part with
// its id, its version and its length.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/packets/Packet.h"

namespace qel::diagnostics {

struct Subpacket {
  Outcome outcome = Outcome::damaged;  // understood: the other two hold
  unsigned version = 0;
  ByteView data;  // behind its head, of the body's memory
};

// The first part with that id; notOurs when there is none.
Subpacket findSubpacket(ByteView body, std::uint8_t id);

// Of the part, which is what changes from modem to modem.
template <std::uint8_t id>
std::optional<unsigned> versionOfSubpacket(ByteView body) {
  const Subpacket part = findSubpacket(body, id);
  return part.outcome == Outcome::understood ? std::optional(part.version) : std::nullopt;
}

}  // namespace qel::diagnostics
