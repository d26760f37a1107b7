// What a tap on a field of a category table tells: everything that is known of that field.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "base/TimeZone.h"
#include "history/Series.h"
#include "history/Viewpoint.h"

namespace qel {

// One of the pairs under the value. `id` names it: "meaning", "range", "clause", "raw",
// "hexadecimal", "decoded" (as many as there are), "age", "source".
struct SheetLine {
  std::string id;
  std::string label;
  std::string value;

  friend bool operator==(const SheetLine&, const SheetLine&) = default;
};

// Texts are ready to be shown.
struct FieldSheet {
  std::string label;  // "RSRP"
  std::string key;    // as the table names it: "nbr_rsrp"
  std::string place;  // "LTE, LTE Neighbor Cell Meas, LTE 0"
  std::string value;  // as in the table
  std::string unit;   // "dBm"; empty: none
  std::string word;   // "good", "fair" or "poor" where the value has a scale; else empty
  // Meaning, range, clause, raw value, what it stands for, age, source: those that there are.
  std::vector<SheetLine> lines;

  // The last ten minutes of a number, in its unit; empty: it is none, or nothing was kept.
  std::vector<Run> curve;
  std::uint64_t curveFromMs = 0;
  std::uint64_t curveToMs = 0;
  float lowest = 0;  // ends of its axis; every value lies within
  float highest = 0;

  std::string clipboard;                     // all of it, a line each
  std::optional<std::uint64_t> receivedMs;   // when its report came; none: nothing was kept of it
  std::optional<std::uint64_t> changesAtMs;  // when its age reads differently without a report
};

// That of a row of a category table as it is drawn from the viewpoint's store. Nothing for a row
// that is no field (a placeholder) and for one that is not there (any more).
std::optional<FieldSheet> fieldSheet(const Viewpoint& viewpoint, std::string_view technology,
                                     std::string_view category, int section, int row,
                                     const TimeZone& zone = systemTimeZone());

// Tells how old its report is at the viewpoint's moment, and leaves all else as it was. True when
// the age reads differently now.
bool tellAge(FieldSheet& sheet, const Viewpoint& viewpoint,
             const TimeZone& zone = systemTimeZone());

// Where the field with this name stands in a section; nothing: it has none.
std::optional<int> rowOfField(const Viewpoint& viewpoint, std::string_view technology,
                              std::string_view category, int section, std::string_view field);

}  // namespace qel
