// Small files, read whole.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "base/Bytes.h"

namespace qel {

struct FileContent {
  enum class Fault : std::uint8_t { none, unreadable, notRegular, tooLarge };

  Bytes bytes;  // empty after any fault
  Fault fault = Fault::none;
  int error = 0;  // of errno, where it is unreadable
};

// A regular file that has no more than `most` bytes; a directory, a device or a pipe is none.
// Neither waits nor throws.
FileContent readFile(const std::string& path, std::size_t most);

// Its content, or nothing after any fault.
inline Bytes contentOfFile(const std::string& path, std::size_t most) {
  return readFile(path, most).bytes;
}

}  // namespace qel
