// Happenings as marks on curves.
#pragma once

#include <cstdint>
#include <vector>

#include "history/Viewpoint.h"
#include "ui/pages/SignalsPage.h"

namespace qel {

// Those within both times that curves are marked with, oldest first.
std::vector<SignalMark> marksBetween(const History& history, std::uint64_t fromMs,
                                     std::uint64_t toMs);

}  // namespace qel
