#include "base/SmallBlocks.h"

#include <mutex>
#include <new>

namespace qel {
namespace {

constexpr std::uint32_t kBlocksOfASize = 64;  // on a thread's shelf
constexpr std::uint32_t kBlocksOfABatch = 32;

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

constinit thread_local std::array<SmallBlocks::Shelf, SmallBlocks::kLargest / SmallBlocks::kStep>
    SmallBlocks::_shelves{};

// Opens the thread's shelves, and gives what they hold to the heap when the thread ends.
struct SmallBlocks::Sweeper {
  // Batches of blocks of one size, from shelves that are full for shelves that are empty.
  class Depot;
  static Depot& depotFor(std::size_t size);

  // Whether this thread has shelves. It opens them at the first call.
  static bool hasShelves() {
    if (!kKeepsBlocks || _hasEnded) return false;
    static thread_local const Sweeper sweeper;
    return true;
  }

  Sweeper() {
    for (Shelf& shelf : _shelves) shelf.room = kBlocksOfASize;
  }
  ~Sweeper() {
    _hasEnded = true;
    for (Shelf& shelf : _shelves) {
      while (Block* block = shelf.first) {
        shelf.first = block->next;
        ::operator delete(block);
      }
      shelf.room = 0;
    }
  }

 private:
  static constinit thread_local bool _hasEnded;
};

constinit thread_local bool SmallBlocks::Sweeper::_hasEnded = false;

class SmallBlocks::Sweeper::Depot {
 public:
  // Fills the shelf, which is empty, with a batch if there is one.
  void fill(Shelf& shelf) {
    const std::lock_guard lock(_mutex);
    if (_count == 0) return;
    shelf.first = _batches[--_count];
    shelf.room -= kBlocksOfABatch;
  }

  // Takes a batch off the shelf, which is full, if there is room for it.
  void relieve(Shelf& shelf) noexcept {
    const std::lock_guard lock(_mutex);
    if (_count == _batches.size()) return;
    Block* last = shelf.first;
    for (std::uint32_t i = 1; i < kBlocksOfABatch; ++i) last = last->next;
    _batches[_count++] = shelf.first;
    shelf.first = last->next;
    last->next = nullptr;
    shelf.room += kBlocksOfABatch;
  }

 private:
  std::mutex _mutex;
  std::array<Block*, 2> _batches{};
  std::size_t _count = 0;
};

SmallBlocks::Sweeper::Depot& SmallBlocks::Sweeper::depotFor(std::size_t size) {
  static constinit std::array<Depot, kLargest / kStep> depots;
  return depots[(size - 1) / kStep];
}

void* SmallBlocks::fromHeap(std::size_t size) {
  if (size > kLargest) return ::operator new(size);
  if (Sweeper::hasShelves()) {
    Shelf& shelf = shelfFor(size);
    Sweeper::depotFor(size).fill(shelf);
    if (shelf.first) return take(size);
  }
  return ::operator new(kKeepsBlocks ? roundedUp(size) : size);
}

void SmallBlocks::toHeap(void* memory, std::size_t size) noexcept {
  if (size > kLargest || !Sweeper::hasShelves()) return ::operator delete(memory);
  Shelf& shelf = shelfFor(size);
  if (shelf.room == 0) Sweeper::depotFor(size).relieve(shelf);
  if (shelf.room == 0) return ::operator delete(memory);
  give(memory, size);
}

}  // namespace qel
