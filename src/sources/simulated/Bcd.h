// Decimal digits two a byte, as SIM files and network identities carry them.
#pragma once

#include <string_view>

#include "base/Bytes.h"

namespace qel::sources {

// The first digit of a pair in the low half; an odd end is filled with F (51.011, clause 10).
Bytes swappedDigits(std::string_view digits);

// The IMSI behind its length, with the type and parity of a mobile identity (31.102, clause 4.2.2).
Bytes encodedImsi(std::string_view digits);

// Country and network code in three bytes (24.008, clause 10.5.1.3); a two-digit network code is
// filled with F. Empty for codes beyond 999.
Bytes encodedPlmn(std::uint32_t mcc, std::uint32_t mnc, std::uint32_t mncDigits);

}  // namespace qel::sources
