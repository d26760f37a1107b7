// A growable row of elements that takes one word where it is held.
#pragma once

#include <algorithm>
#include <cstdint>
#include <initializer_list>
#include <iterator>
#include <memory>
#include <new>
#include <stdexcept>
#include <type_traits>
#include <utility>

#include "base/SmallBlocks.h"

namespace qel {

// As std::vector in what it has of it, but smaller, with its memory from SmallBlocks. May be held
// by a type that is not yet complete. No more than 2^32 - 1 elements.
template <class T>
class Sequence {
 public:
  using value_type = T;
  using const_iterator = const T*;

  Sequence() = default;
  Sequence(std::initializer_list<T> elements) : Sequence(elements.begin(), elements.end()) {}
  template <std::forward_iterator Iterator>
  Sequence(Iterator first, Iterator last) {
    if (first == last) return;
    Filling filling(*this, static_cast<std::size_t>(std::distance(first, last)));
    for (; first != last; ++first) filling.append(*first);
  }
  Sequence(std::size_t count, const T& element) {
    reserve(count);
    for (std::size_t i = 0; i < count; ++i) push_back(element);
  }
  Sequence(const Sequence& other) : Sequence(other.begin(), other.end()) {}
  Sequence(Sequence&& other) noexcept : _block(std::exchange(other._block, nullptr)) {}
  Sequence& operator=(Sequence other) noexcept {
    std::swap(_block, other._block);
    return *this;
  }
  ~Sequence() {
    if (_block) release();
  }

  std::size_t size() const { return _block ? _block->size : 0; }
  bool empty() const { return size() == 0; }
  T* begin() { return _block ? elements(_block) : nullptr; }
  T* end() { return begin() + size(); }
  const T* begin() const { return _block ? elements(_block) : nullptr; }
  const T* end() const { return begin() + size(); }
  const T* data() const { return begin(); }
  T& operator[](std::size_t index) { return begin()[index]; }
  const T& operator[](std::size_t index) const { return begin()[index]; }
  const T& at(std::size_t index) const {
    if (index >= size()) throw std::out_of_range("no such element");
    return begin()[index];
  }
  const T& front() const { return *begin(); }
  T& back() { return end()[-1]; }
  const T& back() const { return end()[-1]; }

  std::size_t capacity() const { return _block ? _block->capacity : 0; }
  void reserve(std::size_t count) {
    if (!_block) {
      _block = take(count);
    } else if (count > _block->capacity) {
      grow(count);
    }
  }
  template <class... Arguments>
  T& emplace_back(Arguments&&... arguments) {
    if (!_block || _block->size == _block->capacity) [[unlikely]]
      return *insertInMore(std::forward<Arguments>(arguments)...);
    T* added = new (end()) T(std::forward<Arguments>(arguments)...);
    ++_block->size;
    return *added;
  }
  void push_back(const T& element) { emplace_back(element); }
  void push_back(T&& element) { emplace_back(std::move(element)); }
  void erase(T* element) {
    std::move(element + 1, end(), element);
    end()[-1].~T();
    --_block->size;
  }
  // Keeps the memory.
  void clear() {
    if (!_block) return;
    std::destroy(begin(), end());
    _block->size = 0;
  }

  friend bool operator==(const Sequence& a, const Sequence& b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end());
  }

  // Appends elements whose number has a known bound, without a look at the room for each. The
  // sequence is used again only when the filling is gone.
  class Filling {
   public:
    [[gnu::always_inline]] Filling(Sequence& sequence, std::size_t atMost) : _sequence(sequence) {
      sequence.reserve(sequence.size() + atMost);
      _next = elements(sequence._block) + sequence._block->size;
    }
    Filling(const Filling&) = delete;
    Filling& operator=(const Filling&) = delete;
    ~Filling() {
      _sequence._block->size = static_cast<std::uint32_t>(_next - elements(_sequence._block));
    }

    template <class... Arguments>
    [[gnu::always_inline]] void append(Arguments&&... arguments) {
      new (_next) T{std::forward<Arguments>(arguments)...};
      ++_next;
    }

   private:
    Sequence& _sequence;
    T* _next;
  };

 private:
  struct Block {
    std::uint32_t size;
    std::uint32_t capacity;
  };

  static T* elements(Block* block) {
    static_assert(alignof(T) <= sizeof(Block));
    return std::launder(reinterpret_cast<T*>(block + 1));
  }
  static std::size_t bytes(std::size_t capacity) { return sizeof(Block) + capacity * sizeof(T); }

  // A block with room for `count` elements and for as many more as its memory has anyway.
  static Block* take(std::size_t count) {
    constexpr std::size_t kStep = SmallBlocks::kStep;
    const std::size_t size = (bytes(count) + kStep - 1) / kStep * kStep;
    const std::size_t room = (size - sizeof(Block)) / sizeof(T);
    return new (SmallBlocks::take(bytes(room))) Block{0, static_cast<std::uint32_t>(room)};
  }

  [[gnu::noinline]] void grow(std::size_t count) {
    Block* larger = take(std::max(count, 2 * capacity()));
    moveTo(larger);
    _block = larger;
  }
  // The arguments may refer to an element, so the new one is made before the old ones move.
  template <class... Arguments>
  [[gnu::noinline]] T* insertInMore(Arguments&&... arguments) {
    constexpr std::size_t kFirst = 4;
    Block* larger = take(std::max(kFirst, 2 * capacity()));
    T* added = new (elements(larger) + size()) T(std::forward<Arguments>(arguments)...);
    if (_block) moveTo(larger);
    ++larger->size;
    _block = larger;
    return added;
  }
  void moveTo(Block* larger) {
    std::uninitialized_move(begin(), end(), elements(larger));
    larger->size = _block->size;
    release();
  }
  [[gnu::noinline]] void release() {
    std::destroy(begin(), end());
    SmallBlocks::give(_block, bytes(_block->capacity));
  }

  Block* _block = nullptr;
};

}  // namespace qel
