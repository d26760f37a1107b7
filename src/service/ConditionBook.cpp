#include "service/ConditionBook.h"

#include <string>
#include <utility>

#include "base/LogSink.h"

namespace qel::service {
namespace {

constexpr std::uint64_t kMinuteMs = 60'000;
constexpr int kMostLinesInMinute = 10;

std::string lineAbout(const sources::SourceCondition& condition) {
  std::string line = "baseband source: " + sources::inWords(condition);
  if (!condition.model.empty()) line += ", model " + condition.model;
  if (!condition.driver.empty()) line += ", driver " + condition.driver;
  return line;
}

}  // namespace

sources::SourceCondition ConditionBook::current() const {
  const std::lock_guard lock(_mutex);
  return _current;
}

void ConditionBook::note(const sources::SourceCondition& condition) {
  if (!replace(condition)) return;
  log(condition);
  tell();
}

void ConditionBook::forget() {
  if (replace({})) tell();
}

void ConditionBook::observe(Observer observer) {
  const std::lock_guard lock(_observerMutex);
  _observer = std::move(observer);
}

bool ConditionBook::replace(const sources::SourceCondition& condition) {
  const std::lock_guard lock(_mutex);
  if (_current == condition) return false;
  _current = condition;
  return true;
}

void ConditionBook::tell() {
  const std::lock_guard lock(_observerMutex);
  if (_observer) _observer();
}

// A modem that comes and goes all the time does not fill the log.
void ConditionBook::log(const sources::SourceCondition& condition) {
  std::string line = lineAbout(condition);
  {
    const std::lock_guard lock(_mutex);
    const std::uint64_t nowMs = _clock.nowMs();
    if (nowMs < _minuteMs || nowMs - _minuteMs >= kMinuteMs) {
      _minuteMs = nowMs;
      _linesInMinute = 0;
    }
    if (++_linesInMinute > kMostLinesInMinute) return;
    if (_linesInMinute == kMostLinesInMinute)
      line += "; further changes within a minute are not told";
  }
  systemLog().write(line);
}

}  // namespace qel::service
