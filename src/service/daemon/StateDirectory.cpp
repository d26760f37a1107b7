#include "service/daemon/StateDirectory.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstdlib>
#include <string_view>

namespace qel::service {
namespace {

constexpr mode_t kOwnerOnly = 0700;

// The value when it is an absolute name, else nothing.
std::string_view absoluteName(const char* variable) {
  const char* value = std::getenv(variable);
  return value && value[0] == '/' ? value : std::string_view();
}

bool isDirectory(const std::string& name) {
  struct stat status {};
  return ::stat(name.c_str(), &status) == 0 && S_ISDIR(status.st_mode);
}

}  // namespace

std::string defaultStateDirectory() {
  const std::string_view given = absoluteName("STATE_DIRECTORY");
  if (!given.empty()) return std::string(given.substr(0, given.find(':')));
  const std::string_view states = absoluteName("XDG_STATE_HOME");
  if (!states.empty()) return std::string(states) + "/basebandd";
  const std::string_view home = absoluteName("HOME");
  return home.empty() ? std::string() : std::string(home) + "/.local/state/basebandd";
}

int makeStateDirectory(const std::string& directory) {
  for (std::size_t end = 0; end != std::string::npos;) {
    end = directory.find('/', end + 1);
    const std::string part = directory.substr(0, end);
    if (isDirectory(part) || ::mkdir(part.c_str(), kOwnerOnly) == 0) continue;
    if (errno != EEXIST || !isDirectory(part)) return errno;  // else somebody was faster
  }
  return 0;
}

}  // namespace qel::service
