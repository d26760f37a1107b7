#include "base/CoreDumps.h"

#include <sys/resource.h>

namespace qel {

// One byte: too small for a file, and the one limit at which Linux calls no collector either, which
// it does at 0. A limit of 0 that somebody set before stays.
void leaveNoCore() {
  rlimit limit{};
  if (::prlimit(0, RLIMIT_CORE, nullptr, &limit) == 0 && limit.rlim_max == 0) return;
  limit = {1, 1};
  ::prlimit(0, RLIMIT_CORE, &limit, nullptr);
}

}  // namespace qel
