// What a source knows about where its events come from, for people who look for a fault.
#pragma once

#include <string>
#include <utility>
#include <vector>

namespace qel::sources {

// Rows of a name and a value, short printable ASCII, in the order in which they are to be shown.
// Nothing in them tells one modem from another of its kind.
struct SourceFacts {
  std::vector<std::pair<std::string, std::string>> rows;

  friend bool operator==(const SourceFacts&, const SourceFacts&) = default;
};

}  // namespace qel::sources
