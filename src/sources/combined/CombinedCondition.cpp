#include "sources/combined/CombinedCondition.h"

#include <algorithm>
#include <array>
#include <string>
#include <string_view>

namespace qel::sources {
namespace {

// Of docs/bus.md, those in which there is nothing to be asked.
constexpr std::array<std::string_view, 10> kNothingThere = {
    "",     "no-bus",    "no-modem-manager", "absent", "no-port",
    "held", "no-rights", "failed",           "silent", "refused"};

void add(std::string& reasons, const std::string& more) {
  if (more.empty()) return;
  if (!reasons.empty()) reasons += "; ";
  reasons += more;
}

}  // namespace

bool isThere(const SourceCondition& condition) {
  return std::ranges::find(kNothingThere, condition.state) == kNothingThere.end();
}

SourceCondition combinedCondition(const SourceCondition& port, const SourceCondition& manager,
                                  bool isPortMissed) {
  const bool isPort = isThere(port);
  const bool isManager = isThere(manager);
  SourceCondition combined = isPort && !isManager ? port : manager;
  if (isPort && !isManager) {
    add(combined.reason, inWords(manager));
  } else if (!isPort && isPortMissed) {
    add(combined.reason, inWords(port));
  }
  return combined;
}

}  // namespace qel::sources
