// Chance that is the same on every run and every machine.
#pragma once

#include <cstdint>

namespace qel::sources {

// Hashes, not a stream: the same arguments always give the same value, so that the radio world is a
// function of place and time and its parts do not disturb one another.
constexpr std::uint64_t scramble(std::uint64_t value) {
  value += 0x9E3779B97F4A7C15;
  value = (value ^ (value >> 30)) * 0xBF58476D1CE4E5B9;
  value = (value ^ (value >> 27)) * 0x94D049BB133111EB;
  return value ^ (value >> 31);
}

template <class... Rest>
constexpr std::uint64_t scramble(std::uint64_t first, std::uint64_t second, Rest... rest) {
  return scramble(scramble(first) ^ second, rest...);
}

// Evenly from 0 up to 1, from a hash.
constexpr double uniformOf(std::uint64_t hash) {
  return static_cast<double>(hash >> 11) * 0x1.0p-53;
}

// Near enough normal, mean 0, deviation 1, never beyond 3.5: the sum of the hash's four quarters.
// Additions only, so that no mathematics library has a say in it.
constexpr double normalOf(std::uint64_t hash) {
  constexpr double kQuarter = 65536.0;
  constexpr double kSqrt3 = 1.7320508075688772;
  double sum = 0;
  for (int i = 0; i < 4; ++i) sum += static_cast<double>(hash >> (16 * i) & 0xFFFF) / kQuarter;
  return (sum - 2.0) * kSqrt3;
}

// A stream of chance for decisions that follow one another.
class Random {
 public:
  explicit Random(std::uint64_t seed) : _state(scramble(seed)) {}
  std::uint64_t next() { return scramble(_state++); }
  // From low to high, both included.
  std::uint64_t between(std::uint64_t low, std::uint64_t high) {
    return low + next() % (high - low + 1);
  }

 private:
  std::uint64_t _state;
};

}  // namespace qel::sources
