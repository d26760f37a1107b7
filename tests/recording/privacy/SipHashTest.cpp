#include "recording/privacy/SipHash.h"

#include <gtest/gtest.h>

#include <array>

namespace qel {
namespace {

// The test vectors that came with the function: key 00 01 … 0F, inputs 00 01 … of growing length.
struct Vector {
  std::size_t length;
  std::uint64_t hash;
};

constexpr std::array kVectors = {
    Vector{0, 0x726FDB47DD0E0E31},  Vector{1, 0x74F839C593DC67FD}, Vector{2, 0x0D6C8009D9A94F5A},
    Vector{3, 0x85676696D7FB7E2D},  Vector{4, 0xCF2794E0277187B7}, Vector{5, 0x18765564CD99A68D},
    Vector{6, 0xCBC9466E58FEE3CE},  Vector{7, 0xAB0200F58B01D137}, Vector{8, 0x93F5F5799A932462},
    Vector{15, 0xA129CA6149BE45E5},
};

TEST(SipHash, givesThePublishedValues) {
  SipKey key;
  for (std::size_t i = 0; i < key.size(); ++i) key[i] = static_cast<std::uint8_t>(i);
  for (const auto& [length, hash] : kVectors) {
    Bytes input;
    for (std::size_t i = 0; i < length; ++i) input.push_back(static_cast<std::uint8_t>(i));
    EXPECT_EQ(sipHash24(key, input), hash) << length;
  }
}

TEST(SipHash, dependsOnEveryBitOfTheKey) {
  const Bytes input = {1, 2, 3};
  const std::uint64_t plain = sipHash24({}, input);
  for (std::size_t bit = 0; bit < 128; ++bit) {
    SipKey key{};
    key[bit / 8] = static_cast<std::uint8_t>(1U << (bit % 8));
    EXPECT_NE(sipHash24(key, input), plain) << bit;
  }
}

}  // namespace
}  // namespace qel
