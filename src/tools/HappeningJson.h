// Happenings and cells as scripts read them.
#pragma once

#include <optional>

#include "base/Value.h"
#include "history/Happening.h"

namespace qel::tools {

// Every key is there, in the same order; null: not known.
Dictionary asJson(const Happening& happening);
Value asJson(const std::optional<Cell>& cell);

}  // namespace qel::tools
