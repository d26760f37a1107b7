// The address of a packet connection of 2G and 3G (24.008, clause 10.5.6.4).
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace qel::diagnostics {

struct PdpAddress {
  std::int32_t type = 0;  // PdpType
  Bytes address;          // empty: not given yet; of both kinds as LTE has it, see pdnAddress
};

// Nothing for types that nobody uses, and when damaged.
std::optional<PdpAddress> pdpAddress(ByteView value);

}  // namespace qel::diagnostics
