// Events on their way to a thread that may be slower than they come.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <mutex>
#include <optional>
#include <string>
#include <unordered_map>

#include "base/Value.h"

namespace tesk {

// Any thread. Holds no more events and bytes than its limits: to make room the oldest goes that has
// a newer one of its metric behind it, or is of no metric; when there is none such, the oldest. So
// whoever takes them all ends with the newest of every metric, in the order in which they came.
class EventBacklog {
 public:
  struct Event {
    std::string name;  // of the stream
    qel::Dictionary entries;
  };
  struct Limits {
    std::size_t events = 4096;
    std::size_t bytes = 4 * 1024 * 1024;  // of keys and values, with a little for each entry
  };

  EventBacklog() = default;
  explicit EventBacklog(Limits limits) : _limits(limits) {}

  // True when the caller is to ask for one more take(): there are never more asked for than events
  // may wait.
  [[nodiscard]] bool add(Event event);
  // The oldest; nothing when it was dropped meanwhile.
  std::optional<Event> take();

  bool isEmpty() const;
  // So far.
  std::uint64_t dropped() const;

 private:
  struct Waiting {
    Event event;
    std::size_t bytes;
    std::optional<std::int64_t> metric;
    std::size_t* ofItsMetric;  // how many wait; null without a metric
  };

  void makeRoom(std::size_t bytes);
  using WaitingEvents = std::deque<Waiting, qel::SmallBlockAllocator<Waiting>>;
  Event remove(WaitingEvents::iterator waiting);

  const Limits _limits;
  mutable std::mutex _mutex;
  WaitingEvents _waiting;
  std::unordered_map<std::int64_t, std::size_t> _metrics;  // those that wait, and some that did
  std::size_t _bytes = 0;
  std::size_t _asked = 0;
  std::uint64_t _dropped = 0;
};

}  // namespace tesk
