#include "radio/Quality.h"

#include <algorithm>
#include <array>
#include <string>
#include <string_view>

#include "base/FatalError.h"

namespace qel {

const QualityScale& scaleOf(Scale scale) {
  constexpr std::array<std::string_view, 6> kNames = {"RSRP", "RSRQ", "SINR",
                                                      "RSCP", "ECNO", "RXLEV"};
  const std::string_view name = kNames.at(static_cast<std::size_t>(scale));
  const auto scales = qualityScales();
  const auto found = std::ranges::find(scales, name, &QualityScale::name);
  if (found == scales.end()) fatalError("the schemas have no scale " + std::string(name));
  return **found;
}

}  // namespace qel
