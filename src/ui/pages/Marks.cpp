#include "ui/pages/Marks.h"

#include <optional>
#include <string>

namespace qel {
namespace {

// A change of cell that is one of technology too has the mark of that alone, and the first cell
// known is no change.
std::optional<char> letterOf(const Happening& happening) {
  switch (happening.kind) {
    case HappeningKind::cell:
      if (!happening.from || !happening.to) return std::nullopt;
      if (happening.from->technology != happening.to->technology) return std::nullopt;
      return happening.move == CellMove::handover ? 'H' : 'R';
    case HappeningKind::rrc:
      return 'C';
    case HappeningKind::technology:
      return 'T';
    default:
      return std::nullopt;
  }
}

}  // namespace

std::vector<SignalMark> marksBetween(const History& history, std::uint64_t fromMs,
                                     std::uint64_t toMs) {
  std::vector<SignalMark> marks;
  const auto& all = history.happenings();
  const std::size_t end = history.happeningsUntil(toMs);
  for (std::size_t i = fromMs == 0 ? 0 : history.happeningsUntil(fromMs - 1); i < end; ++i) {
    const Happening& happening = all[i];
    const auto letter = letterOf(happening);
    if (!letter) continue;
    const bool isSameTime = !marks.empty() && marks.back().timeMs == happening.timeMs;
    if (isSameTime && marks.back().letter == *letter) {
      marks.back().text += "; " + happening.text;
      continue;
    }
    marks.push_back(
        {std::to_string(happening.timeMs) + *letter, happening.timeMs, *letter, happening.text});
  }
  return marks;
}

}  // namespace qel
