// The way into a fuzzer.
#pragma once

#include <cstddef>
#include <cstdint>

#include "fuzz/support/Input.h"

namespace qel::fuzz {

// Each file of fuzz/targets/ defines it. Nothing of one input may show in the next.
void tryInput(Input input);

}  // namespace qel::fuzz
