#include "ui/screens/FirstLevelViewController.h"

#include "ui/screens/Indexing.h"
#include "ui/screens/SecondLevelViewController.h"

namespace qel {

const std::vector<std::string>& FirstLevelViewController::categories() const {
  if (!seguedThroughRow) fatalError("the category menu was opened without a technology");
  const auto found = tableViewFields.firstLevelViewItems.find(*seguedThroughRow);
  if (found == tableViewFields.firstLevelViewItems.end()) {
    fatalError("the category menu was opened with an unknown technology: " + *seguedThroughRow);
  }
  return found->second;
}

int FirstLevelViewController::numberOfSections() { return 1; }

int FirstLevelViewController::numberOfRowsInSection(int /*section*/) {
  return countOf(categories());
}

TableViewCell& FirstLevelViewController::cellForRowAtIndexPath(IndexPath indexPath) {
  TableViewCell& cell =
      requiredTableView().dequeueReusableCellWithIdentifier("FirstClickView", indexPath);
  if (!cell.textLabel) return cell;
  cell.textLabel->text = elementAt(categories(), indexPath.row, "row of the category menu");
  return cell;
}

void FirstLevelViewController::prepareForSegue(const Segue& segue, const Sender* sender) {
  const auto* cell = dynamic_cast<const TableViewCell*>(sender);
  if (!cell) return;
  const auto destination = std::dynamic_pointer_cast<SecondLevelViewController>(segue.destination);
  if (!destination) return;
  destination->firstSelection = seguedThroughRow;
  destination->seguedThroughRow = requiredTextLabel(*cell).text;
}

}  // namespace qel
