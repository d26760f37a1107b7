// Local civil time, as something that a test can stand in for.
#pragma once

#include <cstdint>
#include <string>

namespace qel {

// A point in time as a calendar and a clock on the wall show it.
struct CivilTime {
  std::int64_t year = 1970;
  int month = 1;  // 1 to 12
  int day = 1;    // 1 to 31
  int hour = 0;
  int minute = 0;
  int second = 0;
  std::string zone;  // short name, such as "CEST"
};

// Turns seconds since 1970-01-01 00:00 UTC into local time. Any second up to 2^64 / 1000 either
// side of 1970 has an answer.
class TimeZone {
 public:
  virtual ~TimeZone() = default;
  virtual CivilTime at(std::int64_t seconds) const = 0;
};

// The device's current zone, with its daylight saving rules; follows a change of the zone.
const TimeZone& systemTimeZone();

// "yyyy-MM-dd HH:mm:ss zzz". Milliseconds since 1970-01-01 00:00 UTC; parts of a second are cut
// off toward the past.
std::string dateText(double milliseconds, const TimeZone& zone);

}  // namespace qel
