// How styles look at this terminal.
#pragma once

#include <curses.h>

#include <array>
#include <vector>

#include "tools/watch/Sheet.h"

namespace qel::watch {

// More of a terminal than this is left blank.
inline constexpr Size kLargest{500, 200};

// Of the running curses. Every style can be told without colour; 256 colours are used where they
// are.
class Palette {
 public:
  void begin();
  // So many columns from that place at most; the rest of them is blank. The chosen row is shown
  // the other way round.
  void put(int line, int column, const std::vector<Span>& spans, int columns, bool isChosen) const;

 private:
  std::array<attr_t, 8> _looks{};
  std::array<short, 8> _pairs{};
};

}  // namespace qel::watch
