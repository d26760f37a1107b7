// What a test program takes from the heap through operator new.
#pragma once

#include <cstddef>

namespace qel::testing {

// One count at a time.
class CountedMemory {
 public:
  CountedMemory();
  // The most bytes held at one time since this was made, beyond those held then. One thread.
  std::size_t most() const;
  // How often something was taken since this was made. All threads.
  std::size_t times() const;

 private:
  std::size_t _before;
  std::size_t _timesBefore;
};

}  // namespace qel::testing
