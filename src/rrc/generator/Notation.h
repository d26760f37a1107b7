// The notation of src/rrc/schemas, described in docs/rrc.md: from its text, types as a tree.
#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "rrc/reader/Schema.h"

namespace qel::rrc::generator {

// What is wrong with a schema, as "FILE:LINE: what".
class NotationError : public std::runtime_error {
  using runtime_error::runtime_error;
};

struct Place {
  std::string file;
  std::size_t line = 0;

  [[noreturn]] void refuse(const std::string& what) const {
    throw NotationError(file + ":" + std::to_string(line) + ": " + what);
  }
};

struct Member;

struct Shape {
  Kind kind = Kind::null;
  std::string reference;  // the type of that name; then the rest says nothing
  bool extensible = false;
  bool unbounded = false;
  std::int64_t low = 0;
  std::int64_t high = 0;
  std::vector<std::int64_t> numbers;
  std::vector<Shape> content;  // of a list or of contained octets: one
  std::vector<Member> root;
  std::vector<Member> additions;
};

struct Member {
  Place place;
  std::string name;  // empty: an addition that is skipped
  bool wanted = false;
  bool optional = false;
  Shape shape;
};

struct Definition {
  Place place;
  std::string name;
  bool message = false;  // may be read by itself
  Shape shape;
};

// Appends the types of one file. Throws NotationError.
void readNotation(std::string_view text, const std::string& file,
                  std::vector<Definition>& definitions);

}  // namespace qel::rrc::generator
