// Memory for the many small parts that values and messages are made of.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

namespace qel {

// Blocks that are given back are kept and handed out again, so that work that goes on asks the heap
// for nothing: by each thread, and from threads that only give for those that only take. A bounded
// number is kept; the rest, like everything larger than kLargest, is the heap's. Under
// AddressSanitizer every block is the heap's, so that none is used after its end unseen.
class SmallBlocks {
 public:
  static constexpr std::size_t kStep = 32;  // sizes are rounded up to this
  static constexpr std::size_t kLargest = 2048;

  // Aligned like what operator new gives.
  static void* take(std::size_t size) {
    if (size > kLargest) return fromHeap(size);
    Shelf& shelf = shelfFor(size);
    Block* block = shelf.first;
    if (!block) return fromHeap(size);
    shelf.first = block->next;
    ++shelf.room;
    return block;
  }

  // With the size for which it was taken.
  static void give(void* memory, std::size_t size) noexcept {
    if (size > kLargest || shelfFor(size).room == 0) return toHeap(memory, size);
    Shelf& shelf = shelfFor(size);
    shelf.first = new (memory) Block{shelf.first};
    --shelf.room;
  }

 private:
  struct Block {
    Block* next;
  };
  // The blocks of one size. There is no room before the thread's first block from the heap, and
  // none after its end.
  struct Shelf {
    Block* first = nullptr;
    std::uint32_t room = 0;
  };
  struct Sweeper;

  static Shelf& shelfFor(std::size_t size) { return _shelves[(size - 1) / kStep]; }
  static void* fromHeap(std::size_t size);
  static void toHeap(void* memory, std::size_t size) noexcept;

  static constinit thread_local std::array<Shelf, kLargest / kStep> _shelves;
};

// The same for the standard library.
template <class T>
struct SmallBlockAllocator {
  using value_type = T;

  SmallBlockAllocator() = default;
  template <class Other>
  SmallBlockAllocator(const SmallBlockAllocator<Other>&) noexcept {}

  T* allocate(std::size_t count) { return static_cast<T*>(SmallBlocks::take(count * sizeof(T))); }
  void deallocate(T* memory, std::size_t count) noexcept {
    SmallBlocks::give(memory, count * sizeof(T));
  }
  friend bool operator==(SmallBlockAllocator, SmallBlockAllocator) { return true; }
};

}  // namespace qel
