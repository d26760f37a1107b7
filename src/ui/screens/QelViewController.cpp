#include "ui/screens/QelViewController.h"

#include "ui/screens/FirstLevelViewController.h"
#include "ui/screens/Indexing.h"
#include "ui/screens/QelViewItems.h"

namespace qel {
namespace {

const QelViewItems& catalogue() {
  static const QelViewItems items;
  return items;
}

}  // namespace

int QelViewController::numberOfSections() { return 1; }

int QelViewController::numberOfRowsInSection(int /*section*/) {
  return countOf(catalogue().launchViewItemNames);
}

TableViewCell& QelViewController::cellForRowAtIndexPath(IndexPath indexPath) {
  TableViewCell& cell =
      requiredTableView().dequeueReusableCellWithIdentifier("LaunchView", indexPath);
  if (!cell.textLabel) return cell;
  cell.textLabel->text =
      elementAt(catalogue().launchViewItemNames, indexPath.row, "row of the technology menu");
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
