// What each category shows and which routine of the category table knows it.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "metrics/MetricStore.h"

namespace qel {

// The routines that look categories up. They do not all know the same ones.
enum class Routine : std::uint8_t {
  sections = 1,  // one section an entry, and its title
  rows = 2,
  cells = 4,
};

struct Category {
  std::string_view key;  // technology and category joined by one blank, compared exactly
  std::uint8_t knownTo;  // routines
  // Where the values are: a record, or a list with one record a section. One of the two is set.
  const Dictionary* (*record)(const MetricStore& store);  // null while nothing was reported
  const EntryList* (*list)(const MetricStore& store);
  std::string_view sectionTitle;  // followed by the section's number

  // The record of that section, null while nothing was reported. A section beyond the list is a
  // fatal error.
  const Dictionary* recordOfSection(const MetricStore& store, int section) const;
};

// The category that this routine knows under the key, or nothing.
const Category* findCategory(std::string_view key, Routine routine);

}  // namespace qel
