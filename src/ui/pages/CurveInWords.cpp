#include "ui/pages/CurveInWords.h"

#include <algorithm>
#include <optional>

#include "base/Amounts.h"
#include "ui/pages/Words.h"

namespace qel {

std::string curveInWords(const std::vector<Run>& runs, std::string_view unit) {
  std::optional<float> lowest;
  float highest = 0;
  for (const Run& run : runs) {
    for (const Point& point : run) {
      highest = lowest ? std::max(highest, point.value) : point.value;
      lowest = lowest ? std::min(*lowest, point.value) : point.value;
    }
  }
  if (!lowest) return {};
  const std::string low = figureText(*lowest);
  const std::string high = figureText(highest);
  std::string text = low == high ? "always " + low : "between " + low + " and " + high;
  if (!unit.empty()) (text += ' ') += unit;
  if (runs.size() > 1) text += ", with " + counted(runs.size() - 1, "gap");
  return text;
}

}  // namespace qel
