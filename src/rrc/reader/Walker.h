// Reads a message by a schema's table (X.691, unaligned, and what of X.680 3GPP uses).
#pragma once

#include <cstddef>
#include <optional>

#include "base/Bytes.h"
#include "rrc/reader/Reading.h"
#include "rrc/reader/Schema.h"

namespace qel::rrc {

// A message that is longer, or that has more fields and elements, is not read.
inline constexpr std::size_t kLongestMessage = 65'535;
inline constexpr std::size_t kMostFields = 20'000;

// Nothing when the bits are no such message. Bits behind it are passed over. The schema and the
// message must outlive what is returned. Any thread.
std::optional<Reading> walk(const Schema& schema, TypeIndex type, ByteView message);

}  // namespace qel::rrc
