#include "ui/screens/QelViewController.h"

#include "ui/screens/FirstLevelViewController.h"
#include "ui/screens/Indexing.h"
#include "ui/screens/QelViewItems.h"

namespace qel {
int QelViewController::numberOfSections() { return 1; }

int QelViewController::numberOfRowsInSection(int /*section*/) {
  return countOf(QelViewItems::shared().launchViewItemNames);
}

TableViewCell& QelViewController::cellForRowAtIndexPath(IndexPath indexPath) {
  TableViewCell& cell =
      requiredTableView().dequeueReusableCellWithIdentifier("LaunchView", indexPath);
  if (!cell.textLabel) return cell;
  cell.textLabel->text = elementAt(QelViewItems::shared().launchViewItemNames, indexPath.row,
                                   "row of the technology menu");
  return cell;
}

void QelViewController::prepareForSegue(const Segue& segue, const Sender* sender) {
  const auto* cell = dynamic_cast<const TableViewCell*>(sender);
  if (!cell) return;
  const auto destination = std::dynamic_pointer_cast<FirstLevelViewController>(segue.destination);
  if (!destination) return;
  destination->seguedThroughRow = requiredTextLabel(*cell).text;
}

}  // namespace qel
