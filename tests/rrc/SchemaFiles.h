// Schemas as the tests need them: with names, and read at run time.
#pragma once

#include <string_view>

#include "rrc/generator/Tables.h"

namespace qel::testing {

// The schemas of LTE and of UMTS, every field of them wanted.
const rrc::generator::Tables& lteTables();
const rrc::generator::Tables& umtsTables();

// A schema of a test's own. Throws NotationError.
rrc::generator::Tables tablesOf(std::string_view notation,
                                rrc::generator::Wanted wanted = rrc::generator::Wanted::marked);

}  // namespace qel::testing
