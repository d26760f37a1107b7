// Follows registration from report to report.
#pragma once

#include <array>
#include <cstdint>

#include "base/Value.h"
#include "history/HappeningLog.h"

namespace qel {

// A value that a report repeats, or does not carry, tells nothing new.
class RegistrationFollower {
 public:
  // EMM, GMM and MM contexts.
  void follow(const Report& report, HappeningLog& log);

 private:
  struct Known {
    Value status;
    Value reject;
    Value failure;
  };

  std::array<Known, 3> _known;
};

}  // namespace qel
