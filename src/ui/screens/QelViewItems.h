// The menu catalogue: the technologies and the categories of each.
#pragma once

#include <map>
#include <string>
#include <vector>

namespace qel {

// A plain value that starts with the whole catalogue, in the order of the screens.
struct QelViewItems {
  QelViewItems();
  // One for all who only read it: the timers hold category screens that were left for good.
  static const QelViewItems& shared();

  std::vector<std::string> launchViewItemNames;
  std::map<std::string, std::vector<std::string>, std::less<>> firstLevelViewItems;
};

}  // namespace qel
