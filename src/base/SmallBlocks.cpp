#include "base/SmallBlocks.h"

#include <new>

namespace qel {

constinit thread_local std::array<SmallBlocks::Shelf, SmallBlocks::kLargest / SmallBlocks::kStep>
    SmallBlocks::_shelves{};

// Opens the thread's shelves, and gives what they hold to the heap when the thread ends.
struct SmallBlocks::Sweeper {
  static constexpr std::uint32_t kBlocksOfASize = 64;

  Sweeper() {
    for (Shelf& shelf : _shelves) shelf.room = kBlocksOfASize;
  }
  ~Sweeper() {
    for (Shelf& shelf : _shelves) {
      while (Block* block = shelf.first) {
        shelf.first = block->next;
        ::operator delete(block);
      }
      shelf.room = 0;
    }
  }
};

namespace {

// Each compiler has its own way to say it.
#if defined(__SANITIZE_ADDRESS__)
constexpr bool kKeepsBlocks = false;
#elif defined(__has_feature)
constexpr bool kKeepsBlocks = !__has_feature(address_sanitizer);
#else
constexpr bool kKeepsBlocks = true;
#endif

constexpr std::size_t roundedUp(std::size_t size) {
  return (size + SmallBlocks::kStep - 1) / SmallBlocks::kStep * SmallBlocks::kStep;
}

}  // namespace

void* SmallBlocks::fromHeap(std::size_t size) {
  if constexpr (kKeepsBlocks) [[maybe_unused]]
    static thread_local const Sweeper sweeper;
  return ::operator new(kKeepsBlocks&& size <= kLargest ? roundedUp(size) : size);
}

void SmallBlocks::toHeap(void* memory, std::size_t) noexcept { ::operator delete(memory); }

}  // namespace qel
