// Whether a name is that of a port, or that of a file.
#pragma once

#include <string_view>

namespace qel::diagnostics {

// A device or "@NAME", whether it is there or not; also empty, for the likeliest port.
constexpr bool isPortName(std::string_view name) {
  return name.empty() || name.starts_with('@') || name.starts_with("/dev/");
}

}  // namespace qel::diagnostics
