#include "base/TimeZone.h"

#include <array>
#include <charconv>
#include <cmath>
#include <ctime>

#include "base/FatalError.h"

namespace qel {
namespace {

class SystemTimeZone final : public TimeZone {
 public:
  CivilTime at(std::int64_t seconds) const override {
    ::tzset();  // localtime_r alone would keep the zone of the first call
    const auto time = static_cast<std::time_t>(seconds);
    std::tm local{};
    if (!::localtime_r(&time, &local)) fatalError("a time beyond the calendar");
    return {.year = std::int64_t{local.tm_year} + 1900,
            .month = local.tm_mon + 1,
            .day = local.tm_mday,
            .hour = local.tm_hour,
            .minute = local.tm_min,
            .second = local.tm_sec,
            .zone = local.tm_zone};
  }
};

void appendPadded(std::string& out, std::int64_t number, std::size_t width) {
  std::array<char, 24> digits;
  if (number < 0) out += '-';
  const auto magnitude = static_cast<std::uint64_t>(number < 0 ? -number : number);
  const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), magnitude).ptr;
  const auto length = static_cast<std::size_t>(end - digits.data());
  if (length < width) out.append(width - length, '0');
  out.append(digits.data(), length);
}

}  // namespace

const TimeZone& systemTimeZone() {
  static const SystemTimeZone zone;
  return zone;
}

std::string dateText(double milliseconds, const TimeZone& zone) {
  const CivilTime time = zone.at(static_cast<std::int64_t>(std::floor(milliseconds / 1000.0)));
  std::string out;
  appendPadded(out, time.year, 4);
  out += '-';
  appendPadded(out, time.month, 2);
  out += '-';
  appendPadded(out, time.day, 2);
  out += ' ';
  appendPadded(out, time.hour, 2);
  out += ':';
  appendPadded(out, time.minute, 2);
  out += ':';
  appendPadded(out, time.second, 2);
  out += ' ';
  out += time.zone;
  return out;
}

}  // namespace qel
