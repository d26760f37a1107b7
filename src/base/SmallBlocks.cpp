#include "base/SmallBlocks.h"

#include <array>
#include <mutex>
#include <new>

namespace qel {
namespace {

constexpr std::uint32_t kBlocksOfASize = 64;  // on a thread's shelf
constexpr std::uint32_t kBlocksOfABatch = 32;
constexpr std::size_t kMoreBytes = 4 * 1024 * 1024;  // beyond these, of a thread

// Each compiler has its own way to say it.
#if defined(__SANITIZE_ADDRESS__)
constexpr bool kKeepsBlocks = false;
#elif defined(__has_feature)
constexpr bool kKeepsBlocks = !__has_feature(address_sanitizer);
#else
constexpr bool kKeepsBlocks = true;
#endif

// Of a block that may come onto a shelf, if only that of another thread.
constexpr std::size_t heapSize(std::size_t size) {
  return kKeepsBlocks && size <= SmallBlocks::kLargestRow ? SmallBlocks::rowSize(size) : size;
}

}  // namespace

constinit thread_local SmallBlocks::Shelf SmallBlocks::_shelves[kShelves]{};

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
    for (std::size_t i = 0; i < kSmallShelves; ++i) _shelves[i].room = kBlocksOfASize;
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

  // Whoever asks the heap for a block will have it back: long lists need many of a size.
  static void makeRoom(Shelf& shelf, std::size_t size) {
    if (size > _moreBytes) return;
    _moreBytes -= size;
    ++shelf.room;
  }

 private:
  static constinit thread_local bool _hasEnded;
  static constinit thread_local std::size_t _moreBytes;
};

constinit thread_local bool SmallBlocks::Sweeper::_hasEnded = false;
constinit thread_local std::size_t SmallBlocks::Sweeper::_moreBytes = kMoreBytes;

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

SmallBlocks::Shelf* SmallBlocks::largeShelfFor(std::size_t size) {
  if (size > kLargestRow || !Sweeper::hasShelves()) return nullptr;
  return &_shelves[kSmallShelves + std::bit_width(size - 1) - std::bit_width(kLargest)];
}

void* SmallBlocks::takeLarge(std::size_t size) {
  Shelf* shelf = largeShelfFor(size);
  if (!shelf) return ::operator new(heapSize(size));
  if (Block* block = shelf->first) {
    shelf->first = block->next;
    ++shelf->room;
    return block;
  }
  Sweeper::makeRoom(*shelf, rowSize(size));
  return ::operator new(rowSize(size));
}

void SmallBlocks::giveLarge(void* memory, std::size_t size) noexcept {
  Shelf* shelf = largeShelfFor(size);
  if (!shelf || shelf->room == 0) return ::operator delete(memory);
  put(*shelf, memory);
}

void* SmallBlocks::fromHeap(std::size_t size) {
  if (size > kLargest) return ::operator new(size);
  if (!Sweeper::hasShelves()) return ::operator new(heapSize(size));
  Shelf& shelf = shelfFor(size);
  Sweeper::depotFor(size).fill(shelf);
  if (shelf.first) return take(size);
  Sweeper::makeRoom(shelf, rowSize(size));
  return ::operator new(rowSize(size));
}

void SmallBlocks::toHeap(void* memory, std::size_t size) noexcept {
  if (size > kLargest || !Sweeper::hasShelves()) return ::operator delete(memory);
  Shelf& shelf = shelfFor(size);
  if (shelf.room == 0) Sweeper::depotFor(size).relieve(shelf);
  if (shelf.room == 0) return ::operator delete(memory);
  give(memory, size);
}

}  // namespace qel
