// What a modem says of its own accord on its diagnostics port.
#pragma once

#include <cstdint>

#include "base/Bytes.h"

namespace qel::diagnostics {

// A log packet. The body is the sender's memory and valid while the packet is looked at.
struct LogPacket {
  std::uint16_t code = 0;    // bits 12-15 equipment, 0-11 item
  std::uint64_t timeMs = 0;  // since 1970-01-01 00:00 UTC
  unsigned radio = 0;        // 1, 2 …; 0: the modem does not say
  ByteView body;
};

// One of the modem's events.
struct ModemEvent {
  std::uint16_t id = 0;
  std::uint64_t timeMs = 0;
  unsigned radio = 0;
  ByteView payload;
};

// What became of a packet.
enum class Outcome : std::uint8_t {
  understood,
  unknownVersion,  // of a layout that is not known: nothing was taken from it
  damaged,         // shorter than its layout, or against itself: nothing was taken from it
  notOurs,         // of a kind that tells nothing about a metric
};

}  // namespace qel::diagnostics
