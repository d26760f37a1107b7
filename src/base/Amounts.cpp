#include "base/Amounts.h"

#include <array>
#include <cstdio>

namespace qel {

std::string counted(std::uint64_t count, std::string_view what) {
  return std::to_string(count) + " " + std::string(what) + (count == 1 ? "" : "s");
}

std::string sizeText(std::uint64_t bytes) {
  constexpr std::array kUnits = {"kB", "MB", "GB", "TB"};
  if (bytes < 1000) return std::to_string(bytes) + " bytes";
  double size = static_cast<double>(bytes) / 1000;
  std::size_t unit = 0;
  for (; size >= 1000 && unit + 1 < kUnits.size(); ++unit) size /= 1000;
  std::array<char, 32> text;
  std::snprintf(text.data(), text.size(), "%.1f %s", size, kUnits[unit]);
  return text.data();
}

std::string durationText(std::chrono::seconds duration) {
  const long long seconds = duration.count();
  std::array<char, 48> text;
  std::snprintf(text.data(), text.size(), "%lld:%02lld:%02lld", seconds / 3600, seconds / 60 % 60,
                seconds % 60);
  return text.data();
}

}  // namespace qel
