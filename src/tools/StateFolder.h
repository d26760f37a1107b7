// Where qelctl keeps what outlives it.
#pragma once

#include <string>

namespace qel::tools {

// The given folder, or $STATE_DIRECTORY as systemd sets it, or qelwatch in $XDG_STATE_HOME or in
// ~/.local/state. A ToolError when there is none.
std::string stateFolder(const std::string& given);

}  // namespace qel::tools
