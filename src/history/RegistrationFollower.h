// Follows registration from report to report.
#pragma once

#include <array>
#include <cstdint>

#include "base/Value.h"
#include "history/HappeningLog.h"
#include "history/KnownPlace.h"

namespace qel {

// A value that a report repeats, or does not carry, tells nothing new.
class RegistrationFollower {
 public:
  // EMM, GMM and MM contexts.
  void follow(const Report& report, HappeningLog& log);

 private:
  // A field, and its value in the report that carried it last.
  struct Field {
    explicit Field(Name key) : place(key) {}
    // Whether the record's value is another one than known, which it then is.
    bool isNewIn(const Dictionary& record);

    KnownPlace place;
    Value known;
  };
  struct Known {
    Field status{"reg_status"};
    Field reject{"reject_cause"};
    Field failure{"proc_failure_cause"};
  };

  std::array<Known, 3> _known;
};

}  // namespace qel
