// The curve of any number that a category table shows.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "history/Journal.h"
#include "history/Series.h"
#include "ui/pages/FieldOrigin.h"

namespace qel {

// A number whose course tells something, and none that names or counts.
bool hasCurve(const FieldFacts& facts);

// What the reports kept within both times say of the field, in the unit of the tables, of the same
// entry: `part` is its newest, `section` its place. A report without it is a gap. At most the
// newest 16,384 reports are looked at.
std::vector<Run> fieldCurve(const Journal& journal, const FieldOrigin& origin,
                            std::string_view field, const Dictionary& part, int section,
                            std::uint64_t fromMs, std::uint64_t toMs);

}  // namespace qel
