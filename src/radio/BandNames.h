// What the bands of one technology are called.
#pragma once

#include <cstdint>
#include <string_view>

namespace qel {

// The operating band of a downlink UARFCN, "VIII"; empty where two have it or none.
std::string_view umtsNumeralOf(std::uint32_t uarfcn);

// A SystemBand of GSM, "GSM 900" or "PCS 1900"; empty for any other number.
std::string_view gsmBandName(std::int32_t systemBand);

}  // namespace qel
