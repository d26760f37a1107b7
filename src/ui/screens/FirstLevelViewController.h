// The category menu of one technology.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "metrics/MetricValidator.h"
#include "ui/kit/TableViewController.h"
#include "ui/screens/QelViewItems.h"

namespace qel {

// Hands its technology and the chosen row's text to the category table. Drawn only with a
// technology of the catalogue: anything else is a fatal error.
class FirstLevelViewController final : public TableViewController {
 public:
  std::optional<std::string> seguedThroughRow;  // the technology
  const QelViewItems& tableViewFields = QelViewItems::shared();
  std::shared_ptr<MetricValidator> myMetricValidator = MetricValidator::shared();

  int numberOfSections() override;
  int numberOfRowsInSection(int section) override;
  TableViewCell& cellForRowAtIndexPath(IndexPath indexPath) override;
  void prepareForSegue(const Segue& segue, const Sender* sender) override;

 private:
  const std::vector<std::string>& categories() const;
};

}  // namespace qel
