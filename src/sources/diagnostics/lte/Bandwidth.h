// The code of a bandwidth in reports.
#pragma once

#include <array>
#include <cstdint>
#include <optional>

namespace qel::diagnostics {

// By the number of resource blocks (36.101, table 5.6-1).
inline std::optional<std::uint32_t> bandwidthCode(std::uint32_t blocks) {
  constexpr std::array kBlocks = {6U, 15U, 25U, 50U, 75U, 100U};
  for (std::uint32_t code = 0; code < kBlocks.size(); ++code) {
    if (kBlocks[code] == blocks) return code;
  }
  return std::nullopt;
}

}  // namespace qel::diagnostics
