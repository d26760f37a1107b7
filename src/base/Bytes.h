// Byte buffers and their two text forms.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "base/SmallBlocks.h"

namespace qel {

using Bytes = std::vector<std::uint8_t, SmallBlockAllocator<std::uint8_t>>;
using ByteView = std::span<const std::uint8_t>;

// Lower-case hexadecimal, two digits a byte, no separators.
std::string hexText(ByteView bytes);
void appendHex(std::string& out, ByteView bytes);

// Empty when the text has an odd length or a character that is no hexadecimal digit.
std::optional<Bytes> bytesFromHex(std::string_view text);

// Standard base64 with padding (RFC 4648, section 4).
std::string base64Text(ByteView bytes);

// Empty when the text is not canonical standard base64.
std::optional<Bytes> bytesFromBase64(std::string_view text);

}  // namespace qel
