// A growable row of elements that takes one word where it is held.
#pragma once

#include <algorithm>
#include <bit>
#include <concepts>
#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <iterator>
#include <memory>
#include <new>
#include <stdexcept>
#include <type_traits>
#include <utility>

#include "base/SmallBlocks.h"

namespace qel {

// An element that tells whether it owns anything beyond its own bytes. It may be moved byte for
// byte, copied so while it owns nothing, and then needs no end.
template <class T>
concept TellsWhatItOwns = requires(const T& element) {
  { element.ownsNothing() } -> std::same_as<bool>;
};

// As std::vector in what it has of it, but smaller, with its memory from SmallBlocks. May be held
// by a type that is not yet complete. No more than 2^31 - 1 elements. While all elements own
// nothing and nobody could have changed one, they are copied as one piece and ended without a look
// at each.
template <class T>
class Sequence {
  struct Block;

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
  Sequence(const Sequence& other) {
    if (other.empty()) return;
    if (other.ownsNothing()) {
      _block = take(other.size());
      moveBytes(_block, other._block);
    } else {
      Filling filling(*this, other.size());
      for (const T& element : other) filling.append(element);
    }
  }
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
  T* begin() { return _block ? changed() : nullptr; }
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
  // The same where there is no memory yet.
  [[gnu::always_inline]] void start(std::size_t count) { _block = take(count); }
  template <class... Arguments>
  const T& emplace_back(Arguments&&... arguments) {
    if (!_block || _block->size == _block->capacity) [[unlikely]]
      return *insertInMore(std::forward<Arguments>(arguments)...);
    T* added = new (elements(_block) + _block->size) T(std::forward<Arguments>(arguments)...);
    ++_block->size;
    note(_block, *added);
    return *added;
  }
  // The same, to be changed in its place.
  template <class... Arguments>
  T& addToChange(Arguments&&... arguments) {
    emplace_back(std::forward<Arguments>(arguments)...);
    return changed()[_block->size - 1];
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
    endElements();
    _block->size = 0;
    _block->mayOwn = 0;
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
    // In the room for which memory was reserved before.
    [[gnu::always_inline]] explicit Filling(Sequence& sequence)
        : _sequence(sequence), _next(elements(sequence._block) + sequence._block->size) {}
    Filling(const Filling&) = delete;
    Filling& operator=(const Filling&) = delete;
    ~Filling() {
      Block* block = _sequence._block;
      block->size = static_cast<std::uint32_t>(_next - elements(block));
      if (TellsWhatItOwns<T> && _mayOwn) block->mayOwn = 1;
    }

    template <class... Arguments>
    [[gnu::always_inline]] void append(Arguments&&... arguments) {
      new (_next) T{std::forward<Arguments>(arguments)...};
      _mayOwn = _mayOwn || mayOwn(*_next);
      ++_next;
    }

   private:
    Sequence& _sequence;
    T* _next;
    bool _mayOwn = false;
  };

  // Elements that come in any order, each in a place of its own, at most 64. Moves all together in
  // the end, and looks then whether one may own something; until then the sequence is not used.
  class Spread {
   public:
    // `there` has a bit for the place of each that is there, in order.
    [[gnu::always_inline]] Spread(Sequence& sequence, std::size_t places, std::uint64_t there)
        : _block(spreadable(sequence, places)), _there(there) {
      std::size_t from = std::exchange(_block->size, 0);
      while (from-- > 0) {
        const auto to = static_cast<std::size_t>(std::bit_width(there)) - 1;
        if (from == to) return;  // as all before it
        moveBytes(to, from);
        there ^= std::uint64_t{1} << to;
      }
    }
    Spread(const Spread&) = delete;
    Spread& operator=(const Spread&) = delete;
    [[gnu::always_inline]] ~Spread() {
      auto size = static_cast<std::uint32_t>(std::countr_one(_there));
      for (std::uint64_t apart = _there & (_there + 1); apart != 0; apart &= apart - 1) {
        moveBytes(size++, static_cast<std::uint32_t>(std::countr_zero(apart)));
      }
      const T* first = elements(_block);
      _block->size = size;
      _block->mayOwn = std::any_of(first, first + size, mayOwn) ? 1 : 0;
    }

    bool has(std::size_t place) const { return (_there >> place & 1) != 0; }
    T& operator[](std::size_t place) { return elements(_block)[place]; }
    // In place of the one that may be there.
    template <class... Arguments>
    [[gnu::always_inline]] T& make(std::size_t place, Arguments&&... arguments) {
      T* made = elements(_block) + place;
      if (has(place)) std::destroy_at(made);
      _there |= std::uint64_t{1} << place;
      return *new (made) T{std::forward<Arguments>(arguments)...};
    }

   private:
    static Block* spreadable(Sequence& sequence, std::size_t places) {
      static_assert(TellsWhatItOwns<T>, "moves elements byte for byte");
      sequence.reserve(places);
      return sequence._block;
    }
    void moveBytes(std::size_t to, std::size_t from) {
      T* first = elements(_block);
      std::memcpy(static_cast<void*>(first + to), static_cast<const void*>(first + from),
                  sizeof(T));
    }

    Block* _block;
    std::uint64_t _there;  // a bit for each place
  };

 private:
  struct Block {
    std::uint32_t size;
    std::uint32_t capacity : 31;
    std::uint32_t mayOwn : 1;  // of types that tell: whether an element may own something
  };

  static T* elements(Block* block) {
    static_assert(alignof(T) <= sizeof(Block));
    return std::launder(reinterpret_cast<T*>(block + 1));
  }
  static std::size_t bytes(std::size_t capacity) { return sizeof(Block) + capacity * sizeof(T); }

  static bool mayOwn(const T& element) {
    if constexpr (TellsWhatItOwns<T>) return !element.ownsNothing();
    return true;
  }
  static void note(Block* block, const T& added) {
    if (TellsWhatItOwns<T> && mayOwn(added)) block->mayOwn = 1;
  }
  bool ownsNothing() const { return TellsWhatItOwns<T> && !_block->mayOwn; }
  // For whoever may change them.
  T* changed() {
    if constexpr (TellsWhatItOwns<T>) _block->mayOwn = 1;
    return elements(_block);
  }
  // The elements of `from` and what it knows of them.
  static void moveBytes(Block* to, const Block* from) {
    std::memcpy(static_cast<void*>(to + 1), from + 1, from->size * sizeof(T));
    to->size = from->size;
    to->mayOwn = from->mayOwn;
  }

  // A block with room for `count` elements and for as many more as its memory has anyway.
  static Block* take(std::size_t count) {
    const std::size_t room = (SmallBlocks::rowSize(bytes(count)) - sizeof(Block)) / sizeof(T);
    return new (SmallBlocks::takeRow(bytes(room)))
        Block{0, static_cast<std::uint32_t>(room) & 0x7FFFFFFF, 0};
  }
  static void give(Block* block) { SmallBlocks::giveRow(block, bytes(block->capacity)); }

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
    note(larger, *added);
    _block = larger;
    return added;
  }
  void moveTo(Block* larger) {
    if constexpr (TellsWhatItOwns<T>) {
      moveBytes(larger, _block);
      give(_block);
    } else {
      T* first = elements(_block);
      std::uninitialized_move(first, first + _block->size, elements(larger));
      larger->size = _block->size;
      release();
    }
  }
  [[gnu::noinline]] void release() {
    if (!ownsNothing()) endElements();
    give(_block);
  }
  [[gnu::noinline]] void endElements() {
    std::destroy(elements(_block), elements(_block) + _block->size);
  }

  Block* _block = nullptr;
};

}  // namespace qel
