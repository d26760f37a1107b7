// SipHash-2-4, a keyed function of 64 bits (J.-P. Aumasson, D. J. Bernstein: SipHash, a fast
// short-input PRF, 2012).
#pragma once

#include <array>
#include <cstdint>

#include "base/Bytes.h"

namespace qel {

using SipKey = std::array<std::uint8_t, 16>;

// Without the key nobody can tell the values from random ones. Any thread.
std::uint64_t sipHash24(const SipKey& key, ByteView input);

}  // namespace qel
