#include "recording/privacy/SipHash.h"

#include <bit>

namespace qel {
namespace {

constexpr std::size_t kWordBytes = 8;

// Up to eight bytes, the lowest first.
std::uint64_t wordOf(ByteView bytes) {
  std::uint64_t word = 0;
  for (std::size_t i = 0; i < bytes.size(); ++i) word |= std::uint64_t{bytes[i]} << (8 * i);
  return word;
}

class State {
 public:
  State(std::uint64_t k0, std::uint64_t k1)
      : _v0(k0 ^ 0x736F6D6570736575),
        _v1(k1 ^ 0x646F72616E646F6D),
        _v2(k0 ^ 0x6C7967656E657261),
        _v3(k1 ^ 0x7465646279746573) {}

  void absorb(std::uint64_t word) {
    _v3 ^= word;
    rounds(2);
    _v0 ^= word;
  }

  std::uint64_t finish() {
    _v2 ^= 0xFF;
    rounds(4);
    return _v0 ^ _v1 ^ _v2 ^ _v3;
  }

 private:
  void rounds(int count) {
    for (int i = 0; i < count; ++i) round();
  }

  void round() {
    _v0 += _v1;
    _v2 += _v3;
    _v1 = std::rotl(_v1, 13) ^ _v0;
    _v3 = std::rotl(_v3, 16) ^ _v2;
    _v0 = std::rotl(_v0, 32);
    _v2 += _v1;
    _v0 += _v3;
    _v1 = std::rotl(_v1, 17) ^ _v2;
    _v3 = std::rotl(_v3, 21) ^ _v0;
    _v2 = std::rotl(_v2, 32);
  }

  std::uint64_t _v0;
  std::uint64_t _v1;
  std::uint64_t _v2;
  std::uint64_t _v3;
};

}  // namespace

std::uint64_t sipHash24(const SipKey& key, ByteView input) {
  const ByteView keyBytes(key);
  State state(wordOf(keyBytes.first(kWordBytes)), wordOf(keyBytes.last(kWordBytes)));
  const std::uint64_t length = input.size();
  for (; input.size() >= kWordBytes; input = input.subspan(kWordBytes)) {
    state.absorb(wordOf(input.first(kWordBytes)));
  }
  state.absorb(wordOf(input) | length << 56);
  return state.finish();
}

}  // namespace qel
