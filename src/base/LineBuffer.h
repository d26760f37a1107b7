// A line that is made again and again.
#pragma once

#include <algorithm>
#include <cstddef>
#include <memory>
#include <string_view>
#include <utility>

namespace qel {

// Keeps its memory from line to line, and clears none of it before it is written.
class LineBuffer {
 public:
  // Valid until the line changes.
  std::string_view view() const { return {_characters.get(), _size}; }
  void clear() { _size = 0; }
  void append(std::string_view text) {
    char* end = room(text.size());
    std::copy(text.begin(), text.end(), end);
    writtenTo(end + text.size());
  }

  // Room for `count` more behind the line, for writing; writtenTo says where what is filled ends.
  // endOfRoom is where all that there is ends.
  char* room(std::size_t count) {
    if (_capacity - _size < count) grow(count);
    return _characters.get() + _size;
  }
  char* endOfRoom() { return _characters.get() + _capacity; }
  void writtenTo(const char* end) { _size = static_cast<std::size_t>(end - _characters.get()); }

 private:
  [[gnu::noinline]] void grow(std::size_t count) {
    _capacity = std::max(_size + count, 2 * _capacity);
    auto larger = std::make_unique_for_overwrite<char[]>(_capacity);
    std::copy_n(_characters.get(), _size, larger.get());
    _characters = std::move(larger);
  }

  std::unique_ptr<char[]> _characters;
  std::size_t _size = 0;
  std::size_t _capacity = 0;
};

}  // namespace qel
