// Local civil time, as something that a test can stand in for.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

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
  // Another number than before as soon as the answers may be others.
  virtual std::uint64_t version() const { return 0; }
};

// The device's current zone, with its daylight saving rules. `at` follows a change of the zone at
// once; `version` looks for one once a second.
const TimeZone& systemTimeZone();

// "yyyy-MM-dd HH:mm:ss zzz". Milliseconds since 1970-01-01 00:00 UTC; parts of a second are cut
// off toward the past.
std::string dateText(double milliseconds, const TimeZone& zone);

// The same texts for times that are close to each other: within a quarter of an hour only minutes
// and seconds are written anew, as long as the zone's rules allow, and within a second nothing. One
// thread; the zone must outlive it.
class DateTexts {
 public:
  explicit DateTexts(const TimeZone& zone) : _zone(zone) {}

  // As dateText. Valid until the next call.
  std::string_view at(double milliseconds);

 private:
  bool isInQuarter(double milliseconds) const {
    return milliseconds >= _start && milliseconds < _end;
  }
  void moveTo(double milliseconds);
  void moveWithin(double milliseconds);

  const TimeZone& _zone;
  std::uint64_t _version = 0;
  double _start = 0;  // of the quarter, in milliseconds; no quarter while the end is not behind it
  double _end = 0;
  double _second = 0;  // for which the text stands, as the quarter
  double _nextSecond = 0;
  unsigned _firstSecond = 0;  // of the hour on the wall, at the start
  std::string _text;
  std::size_t _minute = 0;  // its place in the text
};

}  // namespace qel
