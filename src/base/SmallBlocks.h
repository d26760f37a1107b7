// Memory for the many small parts that values and messages are made of.
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <new>

namespace qel {

// Blocks that are given back are kept and handed out again, so that work that goes on asks the heap
// for nothing: by each thread, and from threads that only give for those that only take. A thread
// keeps some of every size and as many as it took from the heap itself, up to a bound; the rest,
// like everything larger than kLargestRow, is the heap's. Under AddressSanitizer every block is the
// heap's, so that none is used after its end unseen.
class SmallBlocks {
 public:
  static constexpr std::size_t kStep = 32;  // sizes are rounded up to this
  static constexpr std::size_t kLargest = 2048;
  static constexpr std::size_t kLargestRow = 256 * 1024;

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
    if (size > kLargest) return toHeap(memory, size);
    Shelf& shelf = shelfFor(size);
    if (shelf.room == 0) return toHeap(memory, size);
    put(shelf, memory);
  }

  // The same for rows of elements, which grow. Large ones have powers of two, in which they fit
  // into each other's blocks; up to kLargestRow these are kept too.
  static constexpr std::size_t rowSize(std::size_t size) {
    return size <= kLargest ? (size + kStep - 1) / kStep * kStep : std::bit_ceil(size);
  }
  static void* takeRow(std::size_t size) { return size > kLargest ? takeLarge(size) : take(size); }
  static void giveRow(void* memory, std::size_t size) noexcept {
    if (size > kLargest) [[unlikely]]
      return giveLarge(memory, size);
    give(memory, size);
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

  static constexpr std::size_t kSmallShelves = kLargest / kStep;
  static constexpr std::size_t kRowShelves = std::bit_width(kLargestRow) - std::bit_width(kLargest);
  static constexpr std::size_t kShelves = kSmallShelves + kRowShelves;

  static Shelf& shelfFor(std::size_t size) { return _shelves[(size - 1) / kStep]; }
  static Shelf* largeShelfFor(std::size_t size);
  static void put(Shelf& shelf, void* memory) noexcept {
    shelf.first = new (memory) Block{shelf.first};
    --shelf.room;
  }

  static void* takeLarge(std::size_t size);
  static void giveLarge(void* memory, std::size_t size) noexcept;
  static void* fromHeap(std::size_t size);
  static void toHeap(void* memory, std::size_t size) noexcept;

  // Found without a call, for programs are linked as one, and without a look at the index.
  [[gnu::tls_model("initial-exec")]] static constinit thread_local Shelf _shelves[kShelves];
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
