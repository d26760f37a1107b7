// A measured number as a page shows it.
#pragma once

#include <string>

#include "history/Quantity.h"
#include "ui/pages/Grade.h"

namespace qel {

// Texts are ready to be shown. Empty `figure`: not known, and nothing else is set but name and
// unit.
struct Reading {
  Quantity quantity = Quantity::lteRsrp;
  std::string name;    // "RSRP"
  std::string figure;  // "-86"
  std::string unit;    // "dBm"
  Grade grade = Grade::unknown;
  std::string word;    // of the grade
  int step = 0;        // of a bar of five; 0: not known
  bool isOld = false;  // older than twice its period
  std::string age;     // "12 s old"; empty while it is not
  std::string spoken;  // all of it, for a screen reader

  friend bool operator==(const Reading&, const Reading&) = default;
};

}  // namespace qel
