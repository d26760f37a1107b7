#include "base/FatalError.h"

#include <unistd.h>

#include <cstdlib>
#include <string>
#include <vector>

namespace qel {
namespace {

std::vector<std::function<void()>>& handlers() {
  static auto& registered = *new std::vector<std::function<void()>>;  // needed to the very end
  return registered;
}

}  // namespace

void atFatalError(std::function<void()> handler) { handlers().push_back(std::move(handler)); }

void fatalError(std::string_view reason) {
  for (const auto& handler : handlers()) handler();
  std::string line = "fatal error: ";
  line += reason;
  line += '\n';
  const ssize_t written = ::write(STDERR_FILENO, line.data(), line.size());
  static_cast<void>(written);
  std::abort();
}

}  // namespace qel
