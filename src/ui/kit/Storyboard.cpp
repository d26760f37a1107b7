#include "ui/kit/Storyboard.h"

namespace qel {

bool followRow(NavigationController& navigation, const Storyboard& storyboard,
               IndexPath indexPath) {
  const auto source =
      std::dynamic_pointer_cast<TableViewController>(navigation.topViewController());
  if (!source || !source->tableView()) return false;
  const TableViewCell* cell = source->tableView()->cellForRowAtIndexPath(indexPath);
  if (!cell) return false;
  const std::shared_ptr<TableViewController> destination =
      storyboard.makeScreen(storyboard.destinationOfCell(cell->identifier));
  if (!destination) return false;
  if (cell->textLabel) destination->setTitle(cell->textLabel->text.value_or(""));
  source->prepareForSegue(Segue{cell->identifier, destination}, cell);
  navigation.pushViewController(destination);
  return true;
}

}  // namespace qel
