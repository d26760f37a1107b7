#include "metrics/EntryList.h"

#include <utility>

#include "metrics/Derivations.h"

namespace qel {

void EntryList::copyNow() const {
  const Due due = std::exchange(_due, {});
  copyEntries(*due.copy, *due.record, _entries, *due.bandwidths);
}

}  // namespace qel
