// Writes the parts of an input that a fuzzer starts from, as fuzz/support/Input.h reads them.
#pragma once

#include <concepts>
#include <cstdint>
#include <string_view>

#include "base/Bytes.h"
#include "base/Value.h"

namespace qel::fuzz {

class Seed {
 public:
  template <std::unsigned_integral T>
  Seed& number(T number) {
    for (std::size_t i = 0; i < sizeof(T); ++i) {
      bytes.push_back(static_cast<std::uint8_t>(number >> (8 * i)));
    }
    return *this;
  }
  Seed& byte(std::size_t value) { return number(static_cast<std::uint8_t>(value)); }
  Seed& piece(ByteView content);
  Seed& rest(ByteView content);
  Seed& text(std::string_view content);
  Seed& key(std::string_view key);
  Seed& value(const Value& value);
  Seed& entries(const Dictionary& entries);

  Bytes bytes;
};

}  // namespace qel::fuzz
