// What is known of the packet connections.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "base/Bytes.h"

namespace qel::diagnostics {

// Codes are those of the report on them (54541).
struct PacketConnection {
  std::uint32_t nsapi = 0;  // 5 to 15; on LTE the bearer's identity
  std::string apn;
  std::optional<std::int32_t> type;
  Bytes address;
  std::vector<Bytes> nameServers;  // at most two
};

struct ConnectionsPart {
  // At most one an nsapi; absent: not known.
  std::optional<std::vector<PacketConnection>> active;
};

}  // namespace qel::diagnostics
