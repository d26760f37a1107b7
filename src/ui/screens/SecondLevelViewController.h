// The table of one category: the fields of its newest record and their values.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "metrics/MetricValidator.h"
#include "ui/kit/TableViewController.h"
#include "ui/screens/QelViewItems.h"

namespace qel {

// Reads the store afresh at every draw and asks for a redraw every five seconds, from its first
// load until the process ends. A section or row that the store does not hold is a fatal error.
class SecondLevelViewController final : public TableViewController {
 public:
  const QelViewItems& tableViewFields = QelViewItems::shared();
  std::optional<std::string> firstSelection;    // the technology
  std::optional<std::string> seguedThroughRow;  // the category
  std::optional<TableViewCell> currentCell;
  std::shared_ptr<MetricValidator> myMetricValidator = MetricValidator::shared();

  void viewDidLoad() override;
  // The timer's target: puts one redraw on the main queue.
  void update();

  int numberOfSections() override;
  std::optional<std::string> titleForHeaderInSection(int section) override;
  int numberOfRowsInSection(int section) override;
  TableViewCell& cellForRowAtIndexPath(IndexPath indexPath) override;
  std::string_view cellOfEmptySection() const override;
  double heightForRowAtIndexPath(IndexPath indexPath) override;
  double estimatedHeightForRowAtIndexPath(IndexPath indexPath) override;

 private:
  std::string categoryKey() const;
};

}  // namespace qel
