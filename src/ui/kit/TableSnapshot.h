// Everything that a table shows at one moment.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "ui/kit/TableViewController.h"

namespace qel {

// Absent text: the cell has no such label, or the label no text.
struct RowSnapshot {
  std::string cellIdentifier;
  std::optional<std::string> text;
  std::optional<std::string> detail;

  friend bool operator==(const RowSnapshot&, const RowSnapshot&) = default;
};

struct SectionSnapshot {
  std::optional<std::string> title;
  std::vector<RowSnapshot> rows;

  friend bool operator==(const SectionSnapshot&, const SectionSnapshot&) = default;
};

struct TableSnapshot {
  std::vector<SectionSnapshot> sections;

  friend bool operator==(const TableSnapshot&, const TableSnapshot&) = default;
};

// Draws the table: asks for the number of sections once, then for each section's title, number of
// rows and rows once, in order. Loads the view if that has not happened.
TableSnapshot snapshotOf(TableViewController& controller);

}  // namespace qel
