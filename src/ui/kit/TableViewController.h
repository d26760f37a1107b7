// A screen that is one table, and the source of its rows.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "ui/kit/IndexPath.h"
#include "ui/kit/TableView.h"
#include "ui/kit/ViewController.h"

namespace qel {

// The row height that follows the cell's content.
inline constexpr double kAutomaticDimension = -1;

class TableViewController : public ViewController {
 public:
  // None until the view is loaded or a table is given.
  const std::shared_ptr<TableView>& tableView() const { return _tableView; }
  void setTableView(std::shared_ptr<TableView> tableView) { _tableView = std::move(tableView); }

  virtual int numberOfSections() { return 1; }
  virtual std::optional<std::string> titleForHeaderInSection(int /*section*/) { return {}; }
  virtual int numberOfRowsInSection(int section) = 0;
  virtual TableViewCell& cellForRowAtIndexPath(IndexPath indexPath) = 0;
  // What a face shows under the title of a section without rows: the prototype of an empty cell.
  virtual std::string_view cellOfEmptySection() const { return {}; }
  virtual double heightForRowAtIndexPath(IndexPath /*indexPath*/) { return kAutomaticDimension; }
  virtual double estimatedHeightForRowAtIndexPath(IndexPath /*indexPath*/) {
    return kAutomaticDimension;
  }

 protected:
  void loadView() override;
  // For the data source operations, which only make sense with a table: none is a fatal error.
  TableView& requiredTableView() const;

 private:
  std::shared_ptr<TableView> _tableView;
};

}  // namespace qel
