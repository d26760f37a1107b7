// How happenings stand in a table.
#pragma once

#include "export/Table.h"
#include "history/Happening.h"

namespace qel {

// time_utc, kind, technology, metric, text, and the cells of a cell change: from_technology,
// from_channel, … and to_technology, to_channel, ….
const Table& happeningTable();
TableRow rowOf(const Happening& happening);

}  // namespace qel
