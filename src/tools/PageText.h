// Pages for people at a terminal that only takes lines.
#pragma once

#include <string>
#include <vector>

#include "ui/pages/NowPage.h"
#include "ui/pages/SignalsPage.h"

namespace qel::tools {

std::vector<std::string> linesOf(const NowPage& page);
std::vector<std::string> linesOf(const SignalsPage& page);

}  // namespace qel::tools
