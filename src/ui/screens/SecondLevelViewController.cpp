#include "ui/screens/SecondLevelViewController.h"

#include <chrono>

#include "base/DispatchQueue.h"
#include "base/LogSink.h"
#include "base/Rendering.h"
#include "ui/kit/RepeatingTimer.h"
#include "ui/kit/RunLoop.h"
#include "ui/screens/CategoryTable.h"
#include "ui/screens/Indexing.h"
#include "ui/screens/Placeholders.h"

namespace qel {
namespace {

constexpr std::chrono::seconds kRefreshInterval{5};
constexpr std::string_view kCell = "SecondClickView";
// The one category whose missing record is worth a line.
constexpr std::string_view kServingCellKey = "LTE Serving Cell Info";
constexpr std::string_view kServingCellMissing = "You are screwed";

// A cell may come from the interface description with fewer labels than there are texts.
void show(std::optional<Label>& label, std::string text) {
  if (label) label->text = std::move(text);
}

}  // namespace

void SecondLevelViewController::viewDidLoad() {
  TableViewController::viewDidLoad();
  const auto self = std::static_pointer_cast<SecondLevelViewController>(shared_from_this());
  // Never invalidated: it holds this screen and keeps it redrawing after it is left.
  const auto timer =
      RepeatingTimer::scheduledTimer(kRefreshInterval, self, &SecondLevelViewController::update);
  RunLoop::main().addTimer(timer, std::chrono::steady_clock::now());
}

void SecondLevelViewController::update() {
  const auto self = std::static_pointer_cast<SecondLevelViewController>(shared_from_this());
  MainQueue::shared().async([self] { self->requiredTableView().reloadData(); });
}

// A selection that was not handed over leaves a key that no routine knows.
std::string SecondLevelViewController::categoryKey() const {
  return firstSelection.value_or("") + " " + seguedThroughRow.value_or("");
}

int SecondLevelViewController::numberOfSections() {
  const Category* category = findCategory(categoryKey(), Routine::sections);
  return category ? countOf(*category->list(*myMetricValidator)) : 1;
}

std::optional<std::string> SecondLevelViewController::titleForHeaderInSection(int section) {
  const Category* category = findCategory(categoryKey(), Routine::sections);
  if (!category) return std::nullopt;
  return std::string(category->sectionTitle) + std::to_string(section);
}

int SecondLevelViewController::numberOfRowsInSection(int section) {
  const Category* category = findCategory(categoryKey(), Routine::rows);
  if (!category) return 1;
  const Dictionary* record = category->recordOfSection(*myMetricValidator, section);
  if (record) return countOf(*record);
  if (category->key == kServingCellKey) standardOutput().write(kServingCellMissing);
  return 1;
}

TableViewCell& SecondLevelViewController::cellForRowAtIndexPath(IndexPath indexPath) {
  TableViewCell& cell = requiredTableView().dequeueReusableCellWithIdentifier(kCell, indexPath);
  const Category* category = findCategory(categoryKey(), Routine::cells);
  if (!category) {
    show(cell.textLabel, std::string(kTableUnknown));
    show(cell.detailTextLabel, std::string(kTableUnknown));
    return cell;
  }
  const Dictionary* record = category->recordOfSection(*myMetricValidator, indexPath.section);
  if (!record) return cell;
  const Dictionary::Entry& entry =
      record->at(checkedIndex(indexPath.row, record->size(), "row of " + categoryKey()));
  show(cell.textLabel, std::string(entry.key.view()));
  show(cell.detailTextLabel, cellText(entry.value));
  return cell;
}

std::string_view SecondLevelViewController::cellOfEmptySection() const { return kCell; }

double SecondLevelViewController::heightForRowAtIndexPath(IndexPath /*indexPath*/) {
  return kAutomaticDimension;
}

double SecondLevelViewController::estimatedHeightForRowAtIndexPath(IndexPath /*indexPath*/) {
  return kAutomaticDimension;
}

}  // namespace qel
