// Texts that stand in a category table where no field does.
#pragma once

#include <string_view>

namespace qel {

// Both texts of the row of a category whose values no routine knows.
inline constexpr std::string_view kTableUnknown = "Come back later";

// Whether a row with these texts is no field: the store's own place for a list that no report has
// filled, or the row above. Any field may have a value that is called like itself.
bool isPlaceholder(std::string_view name, std::string_view value);

}  // namespace qel
