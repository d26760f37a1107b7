// Schemas as the tests need them: with names, and read at run time.
#pragma once

#include <string_view>

#include "rrc/generator/Tables.h"

namespace qel::testing {

// The schema of LTE, every field of it wanted.
const rrc::generator::Tables& lteTables();

// A schema of a test's own. Throws NotationError.
rrc::generator::Tables tablesOf(std::string_view notation,
                                rrc::generator::Wanted wanted = rrc::generator::Wanted::marked);

}  // namespace qel::testing
