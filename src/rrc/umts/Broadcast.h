// Blocks of 20 ms of UMTS's broadcast channel (25.331, clause 8.1.1.1): the pieces of system
// information that each carries.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"

namespace qel::rrc::umts {

struct Segment {
  enum class Kind : std::uint8_t { whole, first, next, last };

  Kind kind = Kind::whole;
  unsigned type = 0;   // 0 the master block, 1 to 7 and 11 by their numbers (clause 10.3.8.18a)
  unsigned count = 0;  // first: of all segments
  unsigned index = 0;  // next, last: 1 and up
  // Where its bits lie in the message.
  std::size_t firstBit = 0;
  std::size_t bits = 0;
};

struct BroadcastBlock {
  unsigned sfnPrime = 0;  // counts blocks, 0 to 2047
  std::vector<Segment> segments;
};

// Any thread. Nothing when the bits are no such block.
std::optional<BroadcastBlock> readBroadcastBlock(ByteView pdu);

}  // namespace qel::rrc::umts
