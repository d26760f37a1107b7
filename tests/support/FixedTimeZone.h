// A time zone with one offset for all times.
#pragma once

#include <ctime>
#include <string>
#include <utility>

#include "base/TimeZone.h"

namespace qel::testing {

class FixedTimeZone final : public TimeZone {
 public:
  FixedTimeZone(std::int64_t offsetSeconds, std::string name)
      : _offsetSeconds(offsetSeconds), _name(std::move(name)) {}

  CivilTime at(std::int64_t seconds) const override {
    const auto time = static_cast<std::time_t>(seconds + _offsetSeconds);
    std::tm civil{};
    ::gmtime_r(&time, &civil);
    return {.year = std::int64_t{civil.tm_year} + 1900,
            .month = civil.tm_mon + 1,
            .day = civil.tm_mday,
            .hour = civil.tm_hour,
            .minute = civil.tm_min,
            .second = civil.tm_sec,
            .zone = _name};
  }

 private:
  std::int64_t _offsetSeconds;
  std::string _name;
};

}  // namespace qel::testing
