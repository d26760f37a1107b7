#include "ui/kit/TableView.h"

#include <utility>

#include "base/FatalError.h"

namespace qel {

void TableView::registerPrototype(TableViewCell prototype) {
  std::string identifier = prototype.identifier;
  _prototypes.insert_or_assign(std::move(identifier), std::move(prototype));
}

TableViewCell& TableView::dequeueReusableCellWithIdentifier(std::string_view identifier,
                                                            IndexPath indexPath) {
  const auto prototype = _prototypes.find(identifier);
  if (prototype == _prototypes.end()) {
    fatalError("no cell prototype with identifier " + std::string(identifier));
  }
  const auto [cell, isNew] = _cells.try_emplace(indexPath, prototype->second);
  if (!isNew && cell->second.identifier != identifier) cell->second = prototype->second;
  return cell->second;
}

const TableViewCell* TableView::cellForRowAtIndexPath(IndexPath indexPath) const {
  const auto cell = _cells.find(indexPath);
  return cell == _cells.end() ? nullptr : &cell->second;
}

void TableView::reloadData() {
  const bool alreadyTold = std::exchange(_needsDrawing, true);
  if (_face && !alreadyTold) _face();
}

void TableView::setFace(Face face) {
  _face = std::move(face);
  if (!_face) _cells.clear();
  if (_face && _needsDrawing) _face();
}

}  // namespace qel
