#include "ui/kit/TableSnapshot.h"

#include <algorithm>

namespace qel {
namespace {

std::optional<std::string> textOf(const std::optional<Label>& label) {
  return label ? label->text : std::nullopt;
}

SectionSnapshot sectionOf(TableViewController& controller, int section) {
  SectionSnapshot snapshot{controller.titleForHeaderInSection(section), {}};
  const int rows = controller.numberOfRowsInSection(section);
  snapshot.rows.reserve(static_cast<std::size_t>(std::max(rows, 0)));
  for (int row = 0; row < rows; ++row) {
    const TableViewCell& cell = controller.cellForRowAtIndexPath({section, row});
    snapshot.rows.push_back(
        {cell.identifier, textOf(cell.textLabel), textOf(cell.detailTextLabel)});
  }
  return snapshot;
}

}  // namespace

TableSnapshot snapshotOf(TableViewController& controller) {
  controller.loadViewIfNeeded();
  TableSnapshot snapshot;
  const int sections = controller.numberOfSections();
  for (int section = 0; section < sections; ++section) {
    snapshot.sections.push_back(sectionOf(controller, section));
  }
  return snapshot;
}

}  // namespace qel
