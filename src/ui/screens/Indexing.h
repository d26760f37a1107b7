// Checked access to what a table draws.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "base/FatalError.h"
#include "ui/kit/TableViewCell.h"

namespace qel {

template <typename Container>
int countOf(const Container& container) {
  return static_cast<int>(container.size());
}

// Stops the program, naming `what`, unless 0 <= index < count.
inline std::size_t checkedIndex(int index, std::size_t count, std::string_view what) {
  if (index < 0 || static_cast<std::size_t>(index) >= count) {
    fatalError("index out of range: " + std::string(what) + " " + std::to_string(index) + " of " +
               std::to_string(count));
  }
  return static_cast<std::size_t>(index);
}

template <typename Container>
decltype(auto) elementAt(const Container& container, int index, std::string_view what) {
  return container[checkedIndex(index, container.size(), what)];
}

// A chosen cell without a text label is a fatal error.
inline const Label& requiredTextLabel(const TableViewCell& cell) {
  if (!cell.textLabel) fatalError("the chosen cell has no text label");
  return *cell.textLabel;
}

}  // namespace qel
