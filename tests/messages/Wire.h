// Pieces of wire format for tests to put together, and inputs that end where their memory ends.
#pragma once

#include <algorithm>
#include <cstdint>
#include <memory>
#include <string_view>

#include "base/Bytes.h"

namespace qel::testing {

inline Bytes varint(std::uint64_t value) {
  Bytes bytes;
  for (; value >= 0x80; value >>= 7) bytes.push_back(static_cast<std::uint8_t>(value | 0x80));
  bytes.push_back(static_cast<std::uint8_t>(value));
  return bytes;
}

enum class WireType : std::uint8_t {
  varint = 0,
  fixed64 = 1,
  delimited = 2,
  groupStart = 3,
  groupEnd = 4,
  fixed32 = 5,
};

inline Bytes tag(std::uint64_t number, WireType type) {
  return varint(number << 3 | static_cast<std::uint64_t>(type));
}

inline void append(Bytes& all, const Bytes& part) {
  for (const std::uint8_t byte : part) all.push_back(byte);
}

template <class... Parts>
Bytes joined(const Parts&... parts) {
  Bytes all;
  (append(all, parts), ...);
  return all;
}

inline Bytes varintField(std::uint64_t number, std::uint64_t value) {
  return joined(tag(number, WireType::varint), varint(value));
}

inline Bytes delimitedField(std::uint64_t number, const Bytes& content) {
  return joined(tag(number, WireType::delimited), varint(content.size()), content);
}

inline Bytes hex(std::string_view text) { return bytesFromHex(text).value(); }

// A heap copy of exactly the bytes' size, so that a sanitizer sees one byte read too many.
class ExactBuffer {
 public:
  explicit ExactBuffer(ByteView bytes)
      : _size(bytes.size()), _bytes(new std::uint8_t[bytes.size()]) {
    std::copy(bytes.begin(), bytes.end(), _bytes.get());
  }
  ByteView view() const { return {_bytes.get(), _size}; }

 private:
  std::size_t _size;
  std::unique_ptr<std::uint8_t[]> _bytes;
};

// Decodes from a buffer of exact size.
template <class Message>
std::shared_ptr<Message> decoded(const Bytes& bytes) {
  const ExactBuffer input(bytes);
  return Message::initWithData(input.view());
}

}  // namespace qel::testing
