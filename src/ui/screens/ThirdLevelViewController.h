// The detail screen of one field: for now a single empty cell.
#pragma once

#include <optional>
#include <string>

#include "ui/kit/TableViewController.h"
#include "ui/screens/QelViewItems.h"

namespace qel {

// Reads no metric and never redraws by itself.
class ThirdLevelViewController final : public TableViewController {
 public:
  std::optional<std::string> firstSelection;
  std::optional<std::string> secondSelection;
  std::optional<std::string> seguedThroughRow;
  const QelViewItems& tableViewFields = QelViewItems::shared();

  int numberOfSections() override;
  int numberOfRowsInSection(int section) override;
  TableViewCell& cellForRowAtIndexPath(IndexPath indexPath) override;
};

}  // namespace qel
