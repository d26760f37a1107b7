#include "ui/screens/ThirdLevelViewController.h"

namespace qel {

int ThirdLevelViewController::numberOfSections() { return 1; }

int ThirdLevelViewController::numberOfRowsInSection(int /*section*/) { return 1; }

TableViewCell& ThirdLevelViewController::cellForRowAtIndexPath(IndexPath indexPath) {
  return requiredTableView().dequeueReusableCellWithIdentifier("ThirdClickView", indexPath);
}

}  // namespace qel
