// Commands to the card and what they read.
#pragma once

#include "sources/diagnostics/Told.h"
#include "sources/diagnostics/picture/Picture.h"

namespace qel::diagnostics {

// Whether the command's data is of use: what is selected, and what is read of files that are kept.
// All other data is passed over byte by byte.
bool isDataKept(const SimPicture& sim);

// The command has ended with that status.
void takeCommand(Picture& picture, Told& told, std::uint8_t firstStatus);

// The card was switched on: nothing is selected on it.
void takeReset(SimPicture& sim);

// A piece is missing: which file is selected is not known any more.
void loseTrack(SimPicture& sim);

}  // namespace qel::diagnostics
