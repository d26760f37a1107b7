#include "support/CountedMemory.h"

#include <malloc.h>

#include <algorithm>
#include <atomic>
#include <cstdlib>
#include <new>

namespace {

std::atomic<std::size_t> held = 0;
std::atomic<std::size_t> mostHeld = 0;
std::atomic<std::size_t> timesTaken = 0;

void* counted(std::size_t size) {
  void* memory = std::malloc(size);
  if (!memory) throw std::bad_alloc();
  ++timesTaken;
  held += ::malloc_usable_size(memory);
  mostHeld = std::max(mostHeld.load(), held.load());
  return memory;
}

void givenBack(void* memory) {
  held -= ::malloc_usable_size(memory);
  std::free(memory);
}

}  // namespace

namespace qel::testing {

CountedMemory::CountedMemory() : _before(held), _timesBefore(timesTaken) { mostHeld = _before; }

std::size_t CountedMemory::most() const { return mostHeld - _before; }

std::size_t CountedMemory::times() const { return timesTaken - _timesBefore; }

}  // namespace qel::testing

void* operator new(std::size_t size) { return counted(size); }
void* operator new[](std::size_t size) { return counted(size); }
void operator delete(void* memory) noexcept { givenBack(memory); }
void operator delete[](void* memory) noexcept { givenBack(memory); }
void operator delete(void* memory, std::size_t) noexcept { givenBack(memory); }
void operator delete[](void* memory, std::size_t) noexcept { givenBack(memory); }
