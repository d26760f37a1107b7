// Small files, read whole.
#pragma once

#include <cstddef>
#include <string>

#include "base/Bytes.h"

namespace qel {

// The content of a regular file that has no more than `most` bytes. Nothing of any other: one that
// cannot be read or is larger, a directory, a device, a pipe. Neither waits nor throws.
Bytes contentOfFile(const std::string& path, std::size_t most);

}  // namespace qel
