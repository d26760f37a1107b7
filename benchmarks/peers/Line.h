// A line that is written into memory of its own, which is used again and grows as it must.
#pragma once

#include <charconv>
#include <cstdint>
#include <cstring>
#include <string_view>
#include <vector>

namespace qel::bench {

// Every value is written with the ", " behind it.
class Line {
 public:
  Line() = default;
  Line(const Line&) = delete;
  Line& operator=(const Line&) = delete;

  std::string_view view() const { return {_memory.data(), size()}; }
  void clear() { _at = _memory.data(); }
  char last() const { return _at[-1]; }
  void back(std::size_t count) { _at -= count; }

  template <std::size_t kSize>
  void literal(const char (&text)[kSize]) {
    need(kSize);
    std::memcpy(_at, text, kSize - 1);
    _at += kSize - 1;
  }

  void append(std::string_view text) {
    need(text.size());
    std::memcpy(_at, text.data(), text.size());
    _at += text.size();
  }

  template <class Number>
  void number(Number value) {
    constexpr std::size_t kLongest = 22;  // of 64 bits, with the ", "
    need(kLongest);
    char* at = _at;
    if (value >= 0 && value < 10) {
      *at++ = static_cast<char>('0' + value);
    } else {
      at = std::to_chars(at, at + kLongest, value).ptr;
    }
    std::memcpy(at, ", ", 2);
    _at = at + 2;
  }

  // All metrics have more than one digit.
  void upperHexadecimal(std::int64_t value) {
    char text[16];
    char* first = text + 16;
    for (auto left = static_cast<std::uint64_t>(value); left != 0; left /= 16) {
      *--first = "0123456789ABCDEF"[left % 16];
    }
    append({first, static_cast<std::size_t>(text + 16 - first)});
  }

  void escaped(std::string_view text) {
    constexpr std::size_t kLongest = 6;  // of one character
    need(text.size() * kLongest);
    for (const char c : text) {
      if (static_cast<unsigned char>(c) < 0x20) {
        std::memcpy(_at, "\\u00", 4);
        _at += 4;
        digits(c);
      } else {
        if (c == '"' || c == '\\') *_at++ = '\\';
        *_at++ = c;
      }
    }
  }

  void hexadecimal(std::string_view bytes) {
    need(bytes.size() * 2);
    for (const char byte : bytes) digits(byte);
  }

 private:
  std::size_t size() const { return static_cast<std::size_t>(_at - _memory.data()); }

  void need(std::size_t count) {
    if (static_cast<std::size_t>(_end - _at) < count) [[unlikely]]
      grow(count);
  }

  [[gnu::noinline]] void grow(std::size_t count) {
    const std::size_t used = size();
    _memory.resize(2 * _memory.size() + count);
    _at = _memory.data() + used;
    _end = _memory.data() + _memory.size();
  }

  void digits(char byte) {
    const auto value = static_cast<unsigned char>(byte);
    *_at++ = "0123456789abcdef"[value >> 4];
    *_at++ = "0123456789abcdef"[value & 15];
  }

  std::vector<char> _memory = std::vector<char>(1024);
  char* _at = _memory.data();
  char* _end = _at + _memory.size();
};

}  // namespace qel::bench
