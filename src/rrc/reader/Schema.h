// The table by which the walker reads: types, their fields, and the numbers that enumerated values
// stand for. Made at build time from src/rrc/schemas; it lives as long as the program.
#pragma once

#include <cstdint>
#include <span>

namespace qel::rrc {

enum class Kind : std::uint8_t {
  null,
  boolean,
  integer,     // low to high
  bits,        // low to high bits, or any number
  octets,      // low to high bytes, or any number; may contain a type
  enumerated,  // low is 0, high the last value of the root
  list,        // low to high elements
  sequence,
  choice,
  stop,  // whatever is here is not read, nor anything behind it
};

// The name of a field whose value is wanted.
enum class Mark : std::uint16_t {
  none,     // not wanted
  element,  // an element of a list that is wanted
  first,    // the first that a schema names
};

enum class TypeIndex : std::uint16_t { none = 0xFFFF };

struct Type {
  Kind kind = Kind::null;
  bool extensible = false;
  bool unbounded = false;  // bits, octets: of any length, which stands in front
  std::int64_t low = 0;
  std::int64_t high = 0;
  TypeIndex content = TypeIndex::none;  // list: of an element; octets: what they contain
  std::uint16_t first = 0;              // sequence, choice: its first field; enumerated: number
  std::uint16_t count = 0;              // fields of the root; enumerated: numbers
  std::uint16_t additions = 0;          // fields that follow those of the root
};

struct Field {
  TypeIndex type = TypeIndex::none;  // none: an addition that is not read
  Mark mark = Mark::none;
  bool optional = false;
};

struct Schema {
  std::span<const Type> types;
  std::span<const Field> fields;
  std::span<const std::int64_t> numbers;  // kNoNumber: the value stands for none

  const Type& operator[](TypeIndex index) const { return types[static_cast<std::size_t>(index)]; }
};

inline constexpr std::int64_t kNoNumber = INT64_MIN;

// How deep types may lie in one another; the generator refuses deeper schemas.
inline constexpr unsigned kDeepest = 24;

}  // namespace qel::rrc
