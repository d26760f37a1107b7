#include "ui/quick/pages/SheetModel.h"

#include <QtGui/QClipboard>
#include <QtGui/QGuiApplication>
#include <utility>

#include "ui/pages/CurveInWords.h"
#include "ui/quick/pages/Words.h"

namespace qel {

void SheetModel::open(Place place) {
  _place = std::move(place);
  _isToRead = true;
  if (_ask) _ask();
}

void SheetModel::close() {
  _place.reset();
  if (!_sheet) return;
  _sheet.reset();
  emit changed();
}

void SheetModel::copy() const {
  if (_sheet) QGuiApplication::clipboard()->setText(shown(_sheet->clipboard));
}

std::optional<std::uint64_t> SheetModel::refresh(const Viewpoint& viewpoint) {
  if (!_place) return {};
  if (std::exchange(_isToRead, false)) {
    read(viewpoint);
  } else if (_sheet && tellAge(*_sheet, viewpoint)) {
    takeLines();
    emit changed();
  }
  return _sheet ? _sheet->changesAtMs : std::nullopt;
}

void SheetModel::read(const Viewpoint& viewpoint) {
  const auto row =
      rowOfField(viewpoint, _place->technology, _place->category, _place->section, _place->field);
  auto sheet = fieldSheet(viewpoint, _place->technology, _place->category, _place->section,
                          row.value_or(_place->row));
  if (!sheet) return close();
  _sheet = std::move(sheet);
  takeLines();
  emit changed();
}

void SheetModel::takeLines() {
  std::vector<RowsModel::Row> rows;
  for (const SheetLine& line : _sheet->lines) {
    rows.push_back({shown(line.id),
                    {},
                    {{"label", shown(line.label)},
                     {"value", shown(line.value)},
                     {"prose", line.id == "meaning"}}});
  }
  _lines.take(std::move(rows));
}

QString SheetModel::curveText() const {
  return hasCurve() ? shown(curveInWords(_sheet->curve, _sheet->unit)) : QString();
}

QString SheetModel::text(std::string FieldSheet::*member) const {
  return _sheet ? shown((*_sheet).*member) : QString();
}

}  // namespace qel
