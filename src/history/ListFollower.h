// Follows what comes to a list and goes from it.
#pragma once

#include <string>
#include <vector>

#include "history/HappeningLog.h"

namespace qel {

// Connections (bearer contexts) and secondary carriers, each of which every report lists anew.
class ListFollower {
 public:
  // No longer list is followed; what is beyond that is not looked at.
  static constexpr std::size_t kMostEntries = 64;

  void followBearers(const Report& report, HappeningLog& log);
  void followCarriers(const Report& report, HappeningLog& log);

 private:
  struct Entry {
    std::string key;   // what it is known by
    std::string text;  // for a reader
  };
  using Entries = std::vector<Entry>;

  static Entries bearersOf(const Dictionary& record);
  static Entries carriersOf(const Dictionary& record);

  Entries _bearers;
  Entries _carriers;
};

}  // namespace qel
