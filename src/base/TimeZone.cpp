#include "base/TimeZone.h"

#include <sys/stat.h>

#include <array>
#include <atomic>
#include <charconv>
#include <cmath>
#include <cstdlib>
#include <ctime>
#include <mutex>
#include <optional>

#include "base/FatalError.h"

namespace qel {
namespace {

static_assert(sizeof(std::time_t) == 8, "a time may be after 2038");

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

  std::uint64_t version() const override {
    // Any clock would do whose seconds change: none is cheaper to read.
    const std::time_t now = std::time(nullptr);
    if (_lookedAt.load(std::memory_order_relaxed) != now) look(now);
    return _version.load(std::memory_order_relaxed);
  }

 private:
  // What the C library makes its zone of.
  struct Origin {
    std::string variable;
    dev_t device = 0;
    ino_t file = 0;
    std::int64_t changed = 0;  // in nanoseconds
    bool operator==(const Origin&) const = default;
  };

  static Origin origin() {
    const char* variable = std::getenv("TZ");
    struct stat file = {};
    ::stat("/etc/localtime", &file);
    return {.variable = variable ? variable : "/",
            .device = file.st_dev,
            .file = file.st_ino,
            .changed = file.st_mtim.tv_sec * std::int64_t{1000000000} + file.st_mtim.tv_nsec};
  }

  [[gnu::noinline]] void look(std::time_t now) const {
    _lookedAt.store(now, std::memory_order_relaxed);
    const std::lock_guard lock(_mutex);
    Origin found = origin();
    if (found == _origin) return;
    _origin = std::move(found);
    ++_version;
  }

  mutable std::atomic<std::time_t> _lookedAt = -1;
  mutable std::atomic<std::uint64_t> _version = 0;
  mutable std::mutex _mutex;
  mutable Origin _origin;
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

char* putTwoDigits(char* at, unsigned number) {
  *at++ = static_cast<char>('0' + number / 10);
  *at++ = static_cast<char>('0' + number % 10);
  return at;
}

constexpr std::int64_t kQuarter = 900;

// The seconds from the start of the hour, where they count on evenly through the quarter that
// starts at `start` and nothing else changes.
std::optional<unsigned> evenQuarter(const CivilTime& start, const CivilTime& end) {
  const auto second = [](const CivilTime& time) { return time.minute * 60 + time.second; };
  const bool even = start.year == end.year && start.month == end.month && start.day == end.day &&
                    start.hour == end.hour && start.zone == end.zone &&
                    second(start) + kQuarter - 1 == second(end);
  return even ? std::optional(static_cast<unsigned>(second(start))) : std::nullopt;
}

}  // namespace

const TimeZone& systemTimeZone() {
  static const auto& zone = *new SystemTimeZone;  // threads may still ask while the process ends
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

std::string_view DateTexts::at(double milliseconds) {
  const bool sameRules = _version == _zone.version();
  if (sameRules && milliseconds >= _second && milliseconds < _nextSecond) return _text;
  if (!sameRules || !isInQuarter(milliseconds)) moveTo(milliseconds);
  if (isInQuarter(milliseconds)) moveWithin(milliseconds);
  return _text;
}

void DateTexts::moveWithin(double milliseconds) {
  const auto passed = static_cast<unsigned>(milliseconds - _start) / 1000;
  char* minute = _text.data() + _minute;
  putTwoDigits(putTwoDigits(minute, (_firstSecond + passed) / 60) + 1,
               (_firstSecond + passed) % 60);
  _second = _start + passed * 1000.0;
  _nextSecond = _second + 1000.0;
}

void DateTexts::moveTo(double milliseconds) {
  constexpr double kExact = 0x1p50;  // up to here parts of a second count
  _version = _zone.version();
  _text = dateText(milliseconds, _zone);
  _end = _start;
  _nextSecond = _second;
  if (!(std::abs(milliseconds) < kExact)) return;
  const auto second = static_cast<std::int64_t>(std::floor(milliseconds / 1000.0));
  const std::int64_t start = second - (second % kQuarter + kQuarter) % kQuarter;
  const CivilTime first = _zone.at(start);
  const auto firstSecond = evenQuarter(first, _zone.at(start + kQuarter - 1));
  if (!firstSecond) return;
  constexpr std::size_t kMinuteAndSecond = 5;
  _minute = _text.size() - first.zone.size() - 1 - kMinuteAndSecond;
  _firstSecond = *firstSecond;
  _start = static_cast<double>(start) * 1000.0;
  _end = static_cast<double>(start + kQuarter) * 1000.0;
}

}  // namespace qel
