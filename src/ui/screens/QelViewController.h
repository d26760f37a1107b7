// The technology menu, the first screen.
#pragma once

#include "ui/kit/TableViewController.h"

namespace qel {

// Hands the chosen row's text to the category menu.
class QelViewController final : public TableViewController {
 public:
  int numberOfSections() override;
  int numberOfRowsInSection(int section) override;
  TableViewCell& cellForRowAtIndexPath(IndexPath indexPath) override;
  void prepareForSegue(const Segue& segue, const Sender* sender) override;
};

}  // namespace qel
