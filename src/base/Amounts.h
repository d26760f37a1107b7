// Counts, sizes and durations in words.
#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <string_view>

namespace qel {

// "1 event", "7 events".
std::string counted(std::uint64_t count, std::string_view what);

// "812 bytes", "96.3 kB", "1.2 GB": thousands, one decimal.
std::string sizeText(std::uint64_t bytes);

// "0:02:07", "26:00:00": hours, minutes, seconds.
std::string durationText(std::chrono::seconds duration);

}  // namespace qel
