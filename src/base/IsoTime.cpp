#include "base/IsoTime.h"

#include <array>
#include <chrono>
#include <cstdio>

namespace qel {

std::string isoTime(std::uint64_t milliseconds) {
  using namespace std::chrono;
  constexpr std::uint64_t kEndOfYear9999 = 253402300800000;
  if (milliseconds >= kEndOfYear9999) return std::to_string(milliseconds);
  const auto count = static_cast<std::int64_t>(milliseconds);
  const year_month_day date(sys_days(days(count / 86'400'000)));
  const auto inDay = static_cast<int>(count % 86'400'000);
  std::array<char, 48> text;
  std::snprintf(text.data(), text.size(), "%04d-%02u-%02uT%02d:%02d:%02d.%03dZ", int{date.year()},
                unsigned{date.month()}, unsigned{date.day()}, inDay / 3'600'000,
                inDay / 60'000 % 60, inDay / 1000 % 60, inDay % 1000);
  return text.data();
}

}  // namespace qel
