#include "ui/kit/TableViewController.h"

#include "base/FatalError.h"

namespace qel {

void TableViewController::loadView() {
  if (!_tableView) _tableView = std::make_shared<TableView>();
}

TableView& TableViewController::requiredTableView() const {
  if (!_tableView) fatalError("the table controller has no table view");
  return *_tableView;
}

}  // namespace qel
