// How what is read of GSM comes into the picture.
#pragma once

#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

// The phone is on that cell, and so on GSM: what belonged to another one goes.
void camp(Picture& picture, const GsmCell& cell);

// Likewise, by what the cell sends to all. A phone elsewhere reads that too when it looks around,
// and stays there.
void enterCell(Picture& picture, const GsmCell& cell);

// The same of a message that names the area alone.
void enterArea(Picture& picture, const LocationArea& area);

// Whether it is a change; the serving cell's report tells of it.
bool setDedicated(GsmPicture& picture, bool dedicated);

// Takes the cell among the neighbours, in the place of what was measured of its carrier before.
// Nothing but the carrier of the serving cell is left out; past GsmPicture::kMostNeighbours the
// oldest goes.
void addNeighbour(GsmPicture& picture, const GsmNeighbour& neighbour);

}  // namespace qel::diagnostics
