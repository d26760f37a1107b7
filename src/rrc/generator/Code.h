// The C++ of a schema's tables.
#pragma once

#include <string>

#include "rrc/generator/Tables.h"

namespace qel::rrc::generator {

// `name` is the namespace's: names of marks and of messages, and `schema()`.
std::string headerCode(const Tables& tables, const std::string& name);
std::string sourceCode(const Tables& tables, const std::string& name);

}  // namespace qel::rrc::generator
