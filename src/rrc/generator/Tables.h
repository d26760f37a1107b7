// From the types of a schema the tables that the walker reads by.
#pragma once

#include <string>
#include <utility>
#include <vector>

#include "rrc/generator/Notation.h"
#include "rrc/reader/Schema.h"

namespace qel::rrc::generator {

struct Tables {
  std::vector<Type> types;
  std::vector<Field> fields;
  std::vector<std::int64_t> numbers;

  std::vector<std::string> fieldNames;                      // one a field
  std::vector<std::string> markNames;                       // one a mark from Mark::first on
  std::vector<std::pair<std::string, TypeIndex>> messages;  // what may be read by itself

  Schema schema() const { return {types, fields, numbers}; }
  TypeIndex message(const std::string& name) const;  // must be there
};

// `every`: all fields are wanted, each with a mark of its own in the order of `fieldNames`.
enum class Wanted { marked, every };

// Throws NotationError for what contradicts itself, lies too deep or is not used.
Tables tablesFrom(const std::vector<Definition>& definitions, Wanted wanted = Wanted::marked);

// The name in C++ of what a schema calls by that name: q-QualMin-r9 is qQualMinR9.
std::string identifier(const std::string& name);

}  // namespace qel::rrc::generator
