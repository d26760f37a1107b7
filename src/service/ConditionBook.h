// What the source last said of its condition, and who wants to know.
#pragma once

#include <cstdint>
#include <functional>
#include <mutex>

#include "base/Clock.h"
#include "sources/SourceCondition.h"

namespace qel::service {

// Any thread. Each change is one line in the system log, up to ten in a minute.
class ConditionBook {
 public:
  // Runs at each change, on the thread of whoever noted it, and under its locks: it may look at the
  // book and wake somebody.
  using Observer = std::function<void()>;

  explicit ConditionBook(const Clock& clock) : _clock(clock) {}

  sources::SourceCondition current() const;
  void note(const sources::SourceCondition& condition);
  // Nothing is known any more, as while the source does not run. Not logged.
  void forget();
  // In place of an earlier one, which is called no more once this has returned; an empty one ends
  // it. Not from within an observer.
  void observe(Observer observer);

 private:
  bool replace(const sources::SourceCondition& condition);
  void tell();
  void log(const sources::SourceCondition& condition);

  const Clock& _clock;
  mutable std::mutex _mutex;  // guards all but the observer
  sources::SourceCondition _current;
  std::uint64_t _minuteMs = 0;  // when the minute began that is counted
  int _linesInMinute = 0;
  std::mutex _observerMutex;  // held while it runs
  Observer _observer;
};

}  // namespace qel::service
