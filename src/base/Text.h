// Immutable text that either owns its characters or points at text that never goes away.
#pragma once

#include <concepts>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

#include "base/SmallBlocks.h"

namespace qel {

// A text of the program itself, such as a key or the name of an enumeration's value: printable
// ASCII without quote and backslash, which the compiler checks. In JSON it stands for itself.
class Name {
 public:
  constexpr Name() = default;
  consteval Name(const char* literal) : _data(literal) {
    for (; literal[_size] != '\0'; ++_size) {
      const char c = literal[_size];
      if (c < ' ' || c > '~' || c == '"' || c == '\\') throw "a name is plain ASCII";
    }
  }

  constexpr std::string_view view() const { return {_data, _size}; }
  constexpr operator std::string_view() const { return view(); }
  constexpr bool empty() const { return _size == 0; }
  template <std::same_as<Name> Same>
  friend constexpr bool operator==(Same a, Same b) {
    return a.view() == b.view();
  }
  friend constexpr bool operator==(Name a, std::string_view b) { return a.view() == b; }

 private:
  friend class Text;

  const char* _data = "";
  std::uint32_t _size = 0;
};

// Sixteen bytes. Names are borrowed, so that a dictionary of a metric is built without copying
// them; anything else is copied and owned.
class Text {
 public:
  Text() = default;
  Text(Name name) : _data(name._data), _size(name._size) {}
  Text(std::string_view copied);
  Text(const std::string& copied) : Text(std::string_view(copied)) {}
  Text(const char* copied) : Text(std::string_view(copied)) {}

  Text(const Text& other) : _data(other._data), _size(other._size) {
    if (other._owned) *this = Text(other.view());
  }
  Text(Text&& other) noexcept { swap(other); }
  Text& operator=(Text other) noexcept {
    swap(other);
    return *this;
  }
  ~Text() {
    if (_owned) SmallBlocks::give(const_cast<char*>(_data), _size);
  }

  std::string_view view() const { return {_data, _size}; }
  operator std::string_view() const { return view(); }
  // Made from a name, or empty.
  bool isName() const { return !_owned; }

  void swap(Text& other) noexcept {
    std::swap(_data, other._data);
    std::swap(_size, other._size);
    std::swap(_owned, other._owned);
  }

  friend bool operator==(const Text& a, const Text& b) { return a.view() == b.view(); }

 private:
  friend class Value;

  const char* _data = "";
  std::uint32_t _size = 0;
  std::uint32_t _owned = 0;  // a boolean, as wide as the size so that both are stored at once
};

}  // namespace qel
