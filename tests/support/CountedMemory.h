// What a test program takes from the heap through operator new, in bytes.
#pragma once

#include <cstddef>

namespace qel::testing {

// The most bytes held at one time since this was made, beyond those held then. One thread, one
// count at a time.
class CountedMemory {
 public:
  CountedMemory();
  std::size_t most() const;

 private:
  std::size_t _before;
};

}  // namespace qel::testing
