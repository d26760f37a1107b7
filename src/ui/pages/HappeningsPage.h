// What happened, newest first.
#pragma once

#include <cstdint>
#include <set>
#include <string>
#include <vector>

#include "base/TimeZone.h"
#include "history/Happening.h"
#include "history/Viewpoint.h"

namespace qel {

struct HappeningsFilter {
  std::set<HappeningKind> kinds;  // empty: every kind
  std::size_t most = 1000;        // rows; older ones are counted only

  friend bool operator==(const HappeningsFilter&, const HappeningsFilter&) = default;
};

struct HappeningRow {
  std::string id;  // the same as long as the row is there
  std::string
      day;  // the header that it stands under: "Today", "Yesterday", "Saturday, 21 November"
  std::string time;  // "20:21:07"
  std::string text;
  std::string record;  // that told it: "KCellularLteScellInfo"; empty: none did
  HappeningKind kind = HappeningKind::cell;
  std::string kindName;    // for people: "Radio link failure"
  std::string technology;  // "LTE"; empty: of none
  std::uint64_t timeMs = 0;
  std::string spoken;

  friend bool operator==(const HappeningRow&, const HappeningRow&) = default;
};

// A kind to filter by; those that never happened are not offered.
struct KindChoice {
  HappeningKind kind = HappeningKind::cell;
  std::string name;
  std::size_t count = 0;
  bool isShown = true;

  friend bool operator==(const KindChoice&, const KindChoice&) = default;
};

struct HappeningsPage {
  std::string notice;  // one sentence while there are no rows
  std::vector<HappeningRow> rows;
  std::vector<KindChoice> kinds;
  std::string older;  // "240 older ones are not shown"; empty: all are
};

HappeningsPage happeningsPage(const Viewpoint& viewpoint, const HappeningsFilter& filter,
                              const TimeZone& zone = systemTimeZone());

// For people, with a capital: "Cell", "Radio link failure".
std::string_view labelOf(HappeningKind kind);

}  // namespace qel
