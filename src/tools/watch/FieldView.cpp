#include "tools/watch/FieldView.h"

#include <algorithm>

#include "tools/watch/Blocks.h"
#include "tools/watch/Rows.h"
#include "ui/pages/FieldSheet.h"

namespace qel::watch {
namespace {

constexpr std::size_t kCurveLines = 6;

FieldSheet gone(const FieldPlace& place) {
  FieldSheet sheet;
  sheet.label = "This field is not reported any more";
  sheet.place = place.technology + ", " + place.category;
  return sheet;
}

}  // namespace

bool FieldView::isThere() const {
  return fieldSheet(_desk.viewpoint(), _place.technology, _place.category, _place.section,
                    _place.row)
      .has_value();
}

Sheet FieldView::sheet(Size size) {
  const FieldSheet field =
      fieldSheet(_desk.viewpoint(), _place.technology, _place.category, _place.section, _place.row)
          .value_or(gone(_place));
  _changesAtMs = field.changesAtMs;
  Sheet sheet;
  sheet.title = field.label;
  sheet.side = field.place;
  sheet.keys = "Escape back  q quit";
  std::string value = field.value;
  if (!field.unit.empty()) value += " " + field.unit;
  if (!field.word.empty()) value += ", " + field.word;
  sheet.rows.push_back(plainRow(value, Style::strong));
  sheet.rows.emplace_back();
  std::size_t columns = 0;
  for (const SheetLine& line : field.lines) columns = std::max(columns, columnsOf(line.label));
  const auto width = static_cast<std::size_t>(size.columns);
  for (const SheetLine& line : field.lines) {
    std::string label = line.label;
    for (std::string& part : wrapped(line.value, width - std::min(width / 2, columns + 2))) {
      sheet.rows.push_back(
          {{{padded(label, columns + 2), Style::muted}, {std::move(part), Style::plain}}, ""});
      label.clear();
    }
  }
  if (field.curve.empty()) return sheet;
  sheet.rows.emplace_back();
  const BlockFrame frame{field.curveFromMs, field.curveToMs, field.lowest, field.highest, width};
  for (std::string& line : bars(field.curve, frame, kCurveLines)) {
    sheet.rows.push_back(plainRow(std::move(line), Style::accent));
  }
  return sheet;
}

}  // namespace qel::watch
