// Takes the parts of a fuzzer's input off its front.
#pragma once

#include <concepts>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "base/Bytes.h"
#include "base/Value.h"

namespace qel::fuzz {

// Past the end everything is zero or empty. fuzz/support/Seed.h writes what this reads.
class Input {
 public:
  Input(const std::uint8_t* data, std::size_t size) : _left(data, size) {}

  bool empty() const { return _left.empty(); }

  template <std::unsigned_integral T>
  T number() {  // the low byte first
    T number = 0;
    for (std::size_t i = 0; i < sizeof(T) && !_left.empty(); ++i) {
      number = static_cast<T>(number | static_cast<T>(T{_left.front()} << (8 * i)));
      _left = _left.subspan(1);
    }
    return number;
  }
  std::uint8_t byte() { return number<std::uint8_t>(); }
  std::size_t below(std::size_t count) { return byte() % count; }

  // Bytes behind their size, in a buffer of their own that ends where they end.
  Bytes piece();
  Bytes rest();
  std::string text();
  // Text that every transport takes: printable ASCII.
  std::string plainText();

  // A key of requests or events, or any text.
  std::string key();
  Value value();
  Dictionary entries();

 private:
  Value valueAt(int depth);
  Dictionary entriesAt(int depth);

  ByteView _left;
};

// The keys that a byte stands for; any other byte is followed by the key as a text.
std::span<const std::string_view> usualKeys();

inline std::string_view textOf(ByteView bytes) {
  return {reinterpret_cast<const char*>(bytes.data()), bytes.size()};
}

}  // namespace qel::fuzz
