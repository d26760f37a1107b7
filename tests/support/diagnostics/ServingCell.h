// The log of LTE's serving cell, in its layout of 29 bytes.
#pragma once

#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {

inline constexpr std::uint16_t kServingCell = 0xB0C2;

inline Bytes servingCell(unsigned pci) {
  return BodyWriter()
      .u8(3)
      .u16(pci)
      .u32(1300)
      .u32(19300)
      .u8(50)
      .u8(50)
      .u32(0x1234501)
      .u16(77)
      .u32(3)
      .u16(1)
      .u8(2)
      .u16(1)
      .u8(0);
}

}  // namespace qel::diagnostics::test
