// The answer to GetCellInfo.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <vector>

#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// The cells of technologies that metrics are for, the serving ones first; at most 256 of them.
// Throws sdbus::Error when the reply is of another type.
std::vector<CellReading> cellsIn(sdbus::Message& reply);

}  // namespace qel::sources
