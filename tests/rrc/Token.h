// What a message says, one field after the other, in a form in which readers can be compared.
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

#include "rrc/generator/Tables.h"
#include "rrc/reader/Reading.h"

namespace qel::testing {

// Of sequences and of what has no value there is none. An element of a list has no name.
struct Token {
  std::string name;
  std::string number;  // an enumerated value's place, an alternative's, the elements of a list
  std::string hex;     // bits from the left, or bytes
  std::string chosen;  // the name of the alternative

  bool operator==(const Token&) const = default;
};

std::ostream& operator<<(std::ostream& stream, const Token& token);

// Of a reading by tables of which every field is wanted.
std::vector<Token> tokensOf(const rrc::Reading& reading, const rrc::generator::Tables& tables);

// One field's, from its type.
Token tokenOf(const rrc::generator::Tables& tables, const rrc::Type& type, std::string name,
              std::int64_t value, const Bytes& leftAligned);

}  // namespace qel::testing
