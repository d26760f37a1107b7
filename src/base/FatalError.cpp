#include "base/FatalError.h"

#include <cstdlib>
#include <string>
#include <vector>

#include "base/TerminalText.h"

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
  complain("fatal error", reason);
  std::abort();
}

}  // namespace qel
