// In which unit a field stands outside of the program.
#pragma once

#include <span>
#include <string>
#include <string_view>

#include "messages/catalogue/FieldFacts.h"
#include "metrics/Derivations.h"

namespace qel {

// The rewrite of that field, or null.
const Rewrite* rewriteOf(std::span<const Rewrite> rewrites, std::string_view key);
// Whether it makes a text of a list, for the screens alone.
bool makesText(const Rewrite& rewrite);
// Whether it holds milliseconds since 1970.
bool isTime(const FieldFacts* facts);
// The unit after that rewrite, if there is one: a value that the dispatcher does not turn into the
// unit of the tables stays as it travels. Empty: none.
std::string unitOf(const FieldFacts* facts, const Rewrite* rewrite);

}  // namespace qel
