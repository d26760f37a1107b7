#include "ui/quick/pages/SheetCurveItem.h"

namespace qel {

std::optional<SmallCurveItem::Drawn> SheetCurveItem::curve() const {
  if (!_page || !_page->sheet()) return std::nullopt;
  const FieldSheet& sheet = *_page->sheet();
  return Drawn{sheet.curve, sheet.curveFromMs, sheet.curveToMs, sheet.lowest, sheet.highest};
}

}  // namespace qel
