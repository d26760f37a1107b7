// Rows that several pages of the terminal have.
#pragma once

#include <string>
#include <vector>

#include "tools/watch/Sheet.h"
#include "ui/pages/Grade.h"
#include "ui/pages/Reading.h"

namespace qel::watch {

Style styleOf(Grade grade);

// "RSRP  -86 dBm  good  ####." in the grade's look; its age where it is old.
std::vector<Span> spansOf(const Reading& reading);

// The words of a text in lines of so many columns at most.
std::vector<std::string> wrapped(const std::string& text, std::size_t columns);

Row plainRow(std::string text, Style style = Style::plain);

}  // namespace qel::watch
