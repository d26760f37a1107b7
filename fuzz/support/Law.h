// What must hold whatever the input is.
#pragma once

#include <string>
#include <string_view>

#include "base/FatalError.h"

namespace qel::fuzz {

// Ends the process unless it holds, so that the fuzzer keeps the input.
inline void law(bool holds, std::string_view what) {
  if (!holds) fatalError("broken law: " + std::string(what));
}

}  // namespace qel::fuzz
