// The packet connections of 2G and 3G on their way: what the phone asked for (24.008,
// clause 6.1.3).
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "sources/diagnostics/picture/ConnectionsPart.h"

namespace qel::diagnostics {

struct ContextsPart {
  struct Context {
    std::uint32_t transaction = 0;  // as the phone numbers it
    bool active = false;            // then it is among the connections as well
    PacketConnection connection;
  };
  static constexpr std::size_t kMost = 16;  // the oldest goes

  std::vector<Context> contexts;
};

}  // namespace qel::diagnostics
