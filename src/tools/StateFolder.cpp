#include "tools/StateFolder.h"

#include <cstdlib>

#include "tools/ToolError.h"

namespace qel::tools {
namespace {

// Of a variable that holds a path; empty: there is none.
std::string pathIn(const char* variable) {
  const char* value = std::getenv(variable);
  return value && value[0] == '/' ? value : "";
}

}  // namespace

std::string stateFolder(const std::string& given) {
  if (!given.empty()) return given;
  const std::string fromSystemd = pathIn("STATE_DIRECTORY");
  if (!fromSystemd.empty()) return fromSystemd;
  std::string state = pathIn("XDG_STATE_HOME");
  if (state.empty() && !pathIn("HOME").empty()) state = pathIn("HOME") + "/.local/state";
  if (!state.empty()) return state + "/qelwatch";
  throw ToolError(EX_USAGE, "--state", "neither XDG_STATE_HOME nor HOME names a folder");
}

}  // namespace qel::tools
