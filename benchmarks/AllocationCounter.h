// Counts what operator new is asked for in this program.
#pragma once

#include <cstdint>

namespace qel::bench {

std::uint64_t allocations();

}  // namespace qel::bench
