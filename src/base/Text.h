// Immutable text that either owns its characters or points at text that never goes away.
#pragma once

#include <cstdint>
#include <limits>
#include <string>
#include <string_view>
#include <utility>

namespace qel {

// Sixteen bytes. Keys and enumeration names come from constant tables and are borrowed, so that a
// dictionary of a metric is built without copying them; anything else is copied and owned.
class Text {
 public:
  Text() = default;
  Text(std::string_view copied);
  Text(const std::string& copied) : Text(std::string_view(copied)) {}
  Text(const char* copied) : Text(std::string_view(copied)) {}

  // `text` must outlive every copy of the result: string literals and constant tables only.
  static Text borrowed(std::string_view text) {
    Text result;
    result._size = checkedSize(text);
    if (result._size != 0) result._data = text.data();
    return result;
  }

  Text(const Text& other);
  Text(Text&& other) noexcept { swap(other); }
  Text& operator=(Text other) noexcept {
    swap(other);
    return *this;
  }
  ~Text() {
    if (_owned) delete[] _data;
  }

  std::string_view view() const { return {_data, _size}; }
  operator std::string_view() const { return view(); }
  bool isBorrowed() const { return !_owned; }

  void swap(Text& other) noexcept {
    std::swap(_data, other._data);
    std::swap(_size, other._size);
    std::swap(_owned, other._owned);
  }

  friend bool operator==(const Text& a, const Text& b) { return a.view() == b.view(); }

 private:
  static std::uint32_t checkedSize(std::string_view text) {
    if (text.size() > std::numeric_limits<std::uint32_t>::max()) refuseSize();
    return static_cast<std::uint32_t>(text.size());
  }
  [[noreturn]] static void refuseSize();

  const char* _data = "";
  std::uint32_t _size = 0;
  bool _owned = false;
};

}  // namespace qel
