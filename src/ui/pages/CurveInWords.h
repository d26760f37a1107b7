// What a curve tells whoever does not see it.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "history/Series.h"

namespace qel {

// "between -112 and -84 dBm, with 1 gap"; empty for a curve without points.
std::string curveInWords(const std::vector<Run>& runs, std::string_view unit);

}  // namespace qel
