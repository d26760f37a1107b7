// Where the service keeps its state unless it is told where.
#pragma once

#include <string>

namespace qel::service {

// $STATE_DIRECTORY (the first, should there be several), else basebandd in $XDG_STATE_HOME, else
// ~/.local/state/basebandd; only absolute names count. Empty when the environment names none.
std::string defaultStateDirectory();

// Makes the directory and those above it, what is new for its owner only. 0 or the error number.
int makeStateDirectory(const std::string& directory);

}  // namespace qel::service
