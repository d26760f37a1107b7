// Messages of 24.008 as a modem logs them: 0x713A.
#pragma once

#include "base/Bytes.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {

inline Bytes toPhone(const Bytes& message) {
  return BodyWriter().u8(0).u32(message.size()).bytes(message);
}

inline Bytes fromPhone(const Bytes& message) {
  return BodyWriter().u8(1).u32(message.size()).bytes(message);
}

}  // namespace qel::diagnostics::test
