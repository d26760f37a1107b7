#include "ui/quick/pages/SheetModel.h"

#include <QtGui/QClipboard>
#include <QtGui/QGuiApplication>
#include <utility>

#include "ui/quick/pages/Words.h"

namespace qel {

void SheetModel::open(Place place) {
  _place = std::move(place);
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
  const auto row =
      rowOfField(viewpoint, _place->technology, _place->category, _place->section, _place->field);
  auto sheet = fieldSheet(viewpoint, _place->technology, _place->category, _place->section,
                          row.value_or(_place->row));
  if (!sheet) {
    close();
    return {};
  }
  _sheet = std::move(sheet);
  takeLines();
  emit changed();
  return _sheet->changesAtMs;
}

void SheetModel::takeLines() {
  std::vector<RowsModel::Row> rows;
  for (const SheetLine& line : _sheet->lines) {
    rows.push_back(
        {shown(line.id), {}, {{"label", shown(line.label)}, {"value", shown(line.value)}}});
  }
  _lines.take(std::move(rows));
}

QString SheetModel::text(std::string FieldSheet::*member) const {
  return _sheet ? shown((*_sheet).*member) : QString();
}

}  // namespace qel
