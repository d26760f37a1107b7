// Decimal digits two a byte, as SIM files and network identities carry them.
#pragma once

#include <optional>
#include <string>

#include "base/Bytes.h"

namespace qel {

// What fills the half of a byte without a digit.
inline constexpr char kFillerDigit = 'f';

// Every half, the low one of each byte first (51.011, clause 10); what is no digit as 'a' to 'f'.
std::string swappedDigits(ByteView bytes);

// The digits alone, of which only the end may be filled up; nothing for bytes that hold others.
std::optional<std::string> packedDigits(ByteView bytes);

// The identity in an element of a mobile identity, behind its length or not: fifteen or sixteen
// digits behind a half byte that tells its type (24.008, clause 10.5.1.4). Nothing for other bytes.
std::optional<std::string> mobileIdentity(ByteView bytes);

}  // namespace qel
