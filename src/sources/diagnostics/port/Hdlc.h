// How packets travel as frames: the packet and its check sum, escaped, with a mark behind.
#pragma once

#include <cstddef>
#include <cstdint>

#include "base/Bytes.h"

namespace qel::diagnostics {

inline constexpr std::uint8_t kFrameMark = 0x7E;
inline constexpr std::uint8_t kFrameEscape = 0x7D;  // the next byte has kEscapedBit changed
inline constexpr std::uint8_t kEscapedBit = 0x20;
inline constexpr std::size_t kCheckSumBytes = 2;  // behind the packet, low byte first

// CRC-16/X-25.
std::uint16_t checkSum(ByteView bytes);

Bytes frameOf(ByteView packet);

}  // namespace qel::diagnostics
