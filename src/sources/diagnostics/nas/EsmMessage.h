// Messages of LTE's session management (24.301, clause 8.3), as far as they are of use here.
#pragma once

#include <cstdint>
#include <optional>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/ConnectionsPart.h"

namespace qel::diagnostics {

enum class EsmType : std::uint8_t {
  other = 0,
  activateRequest = 0xC1,  // of a connection, that is of its default bearer
  activateReject = 0xC3,
  deactivateRequest = 0xCD,
};

struct EsmMessage {
  EsmType type = EsmType::other;
  std::uint32_t bearer = 0;     // 0: none
  PacketConnection connection;  // of activateRequest
};

// Any thread. Nothing when it is damaged.
std::optional<EsmMessage> readEsmMessage(ByteView message);

}  // namespace qel::diagnostics
