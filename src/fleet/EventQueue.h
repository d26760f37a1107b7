// Events that wait to be sent, on the disk.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "base/Clock.h"
#include "fleet/Database.h"

namespace qel::fleet {

struct QueuedEvent {
  std::uint64_t number = 0;  // from 1, one more for each event that was to be sent
  std::string metric;
  std::string line;
};

// Any thread. In a folder of its own, FOLDER/publish.db, for one process at a time. What was added
// outlives the process, and a failure of power once it is settled.
class EventQueue {
 public:
  struct Limits {
    std::uint64_t bytes = 256 * 1000 * 1000;                // of the lines
    std::chrono::milliseconds age = std::chrono::days(14);  // of an event
  };
  struct Counts {
    std::uint64_t waiting = 0;
    std::uint64_t waitingBytes = 0;
    std::uint64_t newest = 0;  // the last number that was given
    // Since the queue was made, as far as the disk took that:
    std::uint64_t dropped = 0;   // unsent, because of a limit
    std::uint64_t lost = 0;      // not added, because the disk would not
    std::uint64_t tooLarge = 0;  // see leaveOut()
  };

  // Makes it where there is none. Nothing when it cannot be used; `error` is then one line.
  static std::unique_ptr<EventQueue> open(const std::string& folder, const Limits& limits,
                                          std::string& error, const Clock& clock = systemClock());

  // Gives it the next number, and drops the oldest ones beyond the limits. False when the event is
  // lost: see error(). Its number is then nobody's, so that a receiver sees it missing.
  bool add(std::uint64_t timeMs, std::string_view metric, std::string_view line);

  // The oldest settled events after this number, of so many bytes in all or one; these are then
  // being sent, and no limit drops them.
  std::vector<QueuedEvent> next(std::uint64_t after, std::size_t mostBytes);
  // One of those being sent is larger than anybody takes: it is counted, and still to be removed.
  void leaveOut();
  // What was being sent waits again.
  void sendAgain();
  // These have arrived. False when the disk does not take that: they then still wait.
  bool remove(std::vector<std::uint64_t> numbers);
  // Brings all to the disk. Before that no number is shown to anybody: after a failure of power it
  // might be given again. False when that fails.
  bool settle();

  Counts counts() const;
  // Tells this row of numbers from that of a queue made anew.
  std::uint32_t stream() const { return _stream; }
  // One line, of what failed last.
  std::string error() const;

 private:
  EventQueue(const Limits& limits, const Clock& clock) : _limits(limits), _clock(clock) {}
  bool prepare(const std::string& folder);
  bool readState();
  bool insert(std::uint64_t timeMs, std::string_view metric, std::string_view line);
  template <class Change>
  bool written(Change change);
  bool forget(std::uint64_t first, std::uint64_t last, Counts& after);
  bool keepFacts(const Counts& counts);
  bool keepLimits();
  bool dropUntil(std::uint64_t number);
  std::optional<std::uint64_t> lastBeyondAge();
  std::optional<std::uint64_t> lastBeyondBytes();

  const Limits _limits;
  const Clock& _clock;
  mutable std::mutex _mutex;
  Database _database;
  std::uint32_t _stream = 0;
  Counts _counts;
  std::uint64_t _sending = 0;  // up to this number
  std::uint64_t _settled = 0;
  std::uint64_t _nextLookAtAgeMs = 0;
};

}  // namespace qel::fleet
