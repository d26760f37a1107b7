// The units of columns.
#pragma once

#include <string>
#include <string_view>

namespace qel {

// "dBm" or the like; empty: none, or not known. A field that the dispatcher turns into another unit
// where some lists hold it has that unit only there: `isDerived`.
std::string unitOf(std::string_view messageClass, std::string_view field, bool isDerived);

}  // namespace qel
