#include "history/Happening.h"

#include <algorithm>

namespace qel {

std::string_view nameOf(HappeningKind kind) {
  switch (kind) {
    case HappeningKind::cell:
      return "cell";
    case HappeningKind::technology:
      return "technology";
    case HappeningKind::rrc:
      return "rrc";
    case HappeningKind::radioLinkFailure:
      return "radio-link-failure";
    case HappeningKind::registration:
      return "registration";
    case HappeningKind::reject:
      return "reject";
    case HappeningKind::bearer:
      return "bearer";
    case HappeningKind::carrier:
      return "carrier";
    case HappeningKind::service:
      return "service";
    case HappeningKind::modem:
      return "modem";
    case HappeningKind::gap:
      return "gap";
    case HappeningKind::mark:
      return "mark";
  }
  return "";
}

std::optional<HappeningKind> happeningKindNamed(std::string_view name) {
  const auto found = std::ranges::find_if(
      kHappeningKinds, [name](HappeningKind kind) { return nameOf(kind) == name; });
  return found == kHappeningKinds.end() ? std::nullopt : std::optional(*found);
}

}  // namespace qel
