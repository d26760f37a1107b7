// A file that is in memory alone.
#pragma once

#include <string>

#include "base/Bytes.h"

namespace qel::fuzz {

// Gone with this object. Its failures are fatal errors.
class MemoryFile {
 public:
  explicit MemoryFile(ByteView content);
  ~MemoryFile();
  MemoryFile(const MemoryFile&) = delete;
  MemoryFile& operator=(const MemoryFile&) = delete;

  // Under which it can be opened, as often as wanted.
  std::string path() const;

 private:
  const int _descriptor;
};

}  // namespace qel::fuzz
