#include "fleet/EventQueue.h"

#include <sys/random.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <utility>

#include "base/FatalError.h"

namespace qel::fleet {
namespace {

constexpr const char* kVersion = "1";
// Before it no clock of a phone was set: the event is as old as the first one after it whose was.
constexpr std::uint64_t kFirstPlausibleMs = 1577836800000;  // 2020-01-01
constexpr std::uint64_t kAgeLookMs = 60 * 1000;

constexpr const char* kTables =
    "CREATE TABLE events (number INTEGER PRIMARY KEY, time_ms INTEGER NOT NULL,"
    " metric TEXT NOT NULL, line TEXT NOT NULL);"
    "CREATE TABLE facts (name TEXT PRIMARY KEY, value INTEGER NOT NULL) WITHOUT ROWID;";

std::uint32_t randomStream() {
  std::uint32_t number = 0;
  if (::getrandom(&number, sizeof number, 0) != static_cast<ssize_t>(sizeof number)) {
    fatalError("the system gives no random bytes");
  }
  return number == 0 ? 1 : number;
}

bool makeFolder(const std::string& folder, std::string& error) {
  std::error_code code;
  std::filesystem::create_directories(std::filesystem::path(folder).parent_path(), code);
  if (::mkdir(folder.c_str(), 0700) == 0 || errno == EEXIST) return true;
  error = folder + ": " + std::strerror(errno);
  return false;
}

}  // namespace

std::unique_ptr<EventQueue> EventQueue::open(const std::string& folder, const Limits& limits,
                                             std::string& error, const Clock& clock) {
  if (!makeFolder(folder, error)) return nullptr;
  std::unique_ptr<EventQueue> queue(new EventQueue(limits, clock));
  if (queue->prepare(folder) && queue->readState() && queue->keepLimits()) return queue;
  error = queue->_database.error();
  return nullptr;
}

bool EventQueue::prepare(const std::string& folder) {
  // Small pages, for an event is small and goes to the disk by itself. Exclusive: no other process,
  // and so no memory to share with one.
  if (!_database.open(folder + "/publish.db") ||
      !_database.execute("PRAGMA page_size = 1024; PRAGMA locking_mode = EXCLUSIVE;"
                         "PRAGMA journal_mode = WAL; PRAGMA synchronous = NORMAL;"
                         "BEGIN IMMEDIATE")) {
    return false;
  }
  std::uint64_t version = 0;
  {
    auto asked = _database.run("PRAGMA user_version");
    if (asked.row()) version = asked.number(0);
    if (asked.hasFailed()) return false;
  }
  if (version == 0) {
    if (!_database.execute(std::string(kTables) + "PRAGMA user_version = " + kVersion))
      return false;
    auto made = _database.run("INSERT INTO facts VALUES ('stream', ?1)");
    if (!made.with(randomStream()).done()) return false;
  } else if (std::to_string(version) != kVersion) {
    return _database.fail("was made by another version of the program");
  }
  return _database.execute("COMMIT");
}

bool EventQueue::readState() {
  {
    auto facts = _database.run("SELECT name, value FROM facts");
    while (facts.row()) {
      const std::string name = facts.text(0);
      if (name == "stream") _stream = static_cast<std::uint32_t>(facts.number(1));
      if (name == "newest") _counts.newest = facts.number(1);
      if (name == "dropped") _counts.dropped = facts.number(1);
      if (name == "lost") _counts.lost = facts.number(1);
      if (name == "too_large") _counts.tooLarge = facts.number(1);
    }
    if (facts.hasFailed()) return false;
  }
  auto events =
      _database.run("SELECT count(*), sum(length(CAST(line AS BLOB))), max(number) FROM events");
  if (events.row()) {
    _counts.waiting = events.number(0);
    _counts.waitingBytes = events.number(1);
    _counts.newest = std::max(_counts.newest, events.number(2));
  }
  return !events.hasFailed();
}

bool EventQueue::insert(std::uint64_t timeMs, std::string_view metric, std::string_view line) {
  return _database.run("INSERT INTO events VALUES (?1, ?2, ?3, ?4)")
      .with(_counts.newest)
      .with(timeMs)
      .with(metric)
      .with(line)
      .done();
}

// The newest number for when no event is left that tells it.
bool EventQueue::keepFacts(const Counts& counts) {
  return _database
      .run(
          "REPLACE INTO facts VALUES ('newest', ?1), ('dropped', ?2), ('lost', ?3),"
          " ('too_large', ?4)")
      .with(counts.newest)
      .with(counts.dropped)
      .with(counts.lost)
      .with(counts.tooLarge)
      .done();
}

// Once more after the log was given back, which on a full disk may be all the room there is.
template <class Change>
bool EventQueue::written(Change change) {
  return change() || _database.rollBack() ||
         (_database.execute("PRAGMA wal_checkpoint(TRUNCATE)") && change()) || _database.rollBack();
}

bool EventQueue::add(std::uint64_t timeMs, std::string_view metric, std::string_view line) {
  const std::lock_guard lock(_mutex);
  ++_counts.newest;
  if (!written([&] { return insert(timeMs, metric, line); })) {
    ++_counts.lost;
    return false;
  }
  ++_counts.waiting;
  _counts.waitingBytes += line.size();
  keepLimits();
  return true;
}

// The newest one that is too old, and with it all before it.
std::optional<std::uint64_t> EventQueue::lastBeyondAge() {
  const std::uint64_t now = _clock.nowMs();
  if (now < _nextLookAtAgeMs && _nextLookAtAgeMs - now <= kAgeLookMs) return std::nullopt;
  _nextLookAtAgeMs = now + kAgeLookMs;
  const auto age = static_cast<std::uint64_t>(_limits.age.count());
  if (now < kFirstPlausibleMs + age) return std::nullopt;
  std::optional<std::uint64_t> last;
  auto oldest = _database.run(
      "SELECT number, time_ms FROM events WHERE number > ?1 AND"
      " time_ms >= ?2 ORDER BY number");
  oldest.with(_sending).with(kFirstPlausibleMs);
  while (oldest.row() && oldest.number(1) < now - age) last = oldest.number(0);
  return last;
}

std::optional<std::uint64_t> EventQueue::lastBeyondBytes() {
  std::uint64_t bytes = _counts.waitingBytes;
  if (bytes <= _limits.bytes) return std::nullopt;
  std::optional<std::uint64_t> last;
  auto oldest = _database.run(
      "SELECT number, length(CAST(line AS BLOB)) FROM events"
      " WHERE number > ?1 ORDER BY number");
  oldest.with(_sending);
  while (bytes > _limits.bytes && oldest.row()) {
    last = oldest.number(0);
    bytes -= oldest.number(1);
  }
  return last;
}

// Events from the first number to the last, which leaves `after`. Within a transaction.
bool EventQueue::forget(std::uint64_t first, std::uint64_t last, Counts& after) {
  {
    auto gone = _database.run(
        "SELECT count(*), sum(length(CAST(line AS BLOB))) FROM events"
        " WHERE number BETWEEN ?1 AND ?2");
    if (!gone.with(first).with(last).row()) return false;
    after.waiting -= gone.number(0);
    after.waitingBytes -= gone.number(1);
  }
  return _database.run("DELETE FROM events WHERE number BETWEEN ?1 AND ?2")
      .with(first)
      .with(last)
      .done();
}

bool EventQueue::dropUntil(std::uint64_t number) {
  Counts after = _counts;
  if (!_database.execute("BEGIN IMMEDIATE") || !forget(_sending + 1, number, after)) {
    return _database.rollBack();
  }
  after.dropped += _counts.waiting - after.waiting;
  if (!keepFacts(after) || !_database.execute("COMMIT")) return _database.rollBack();
  _counts = after;
  return true;
}

bool EventQueue::keepLimits() {
  for (const auto& last : {lastBeyondAge(), lastBeyondBytes()}) {
    if (last && !dropUntil(*last)) return false;
  }
  return true;
}

std::vector<QueuedEvent> EventQueue::next(std::uint64_t after, std::size_t mostBytes) {
  const std::lock_guard lock(_mutex);
  std::vector<QueuedEvent> events;
  std::size_t bytes = 0;
  auto waiting = _database.run(
      "SELECT number, metric, line FROM events WHERE number > ?1"
      " AND number <= ?2 ORDER BY number");
  waiting.with(after).with(_settled);
  while (bytes < mostBytes && waiting.row()) {
    events.push_back({waiting.number(0), waiting.text(1), waiting.text(2)});
    bytes += events.back().line.size();
  }
  if (!events.empty()) _sending = events.back().number;
  return events;
}

void EventQueue::leaveOut() {
  const std::lock_guard lock(_mutex);
  ++_counts.tooLarge;
}

void EventQueue::sendAgain() {
  const std::lock_guard lock(_mutex);
  _sending = 0;
}

bool EventQueue::remove(std::vector<std::uint64_t> numbers) {
  std::ranges::sort(numbers);
  const std::lock_guard lock(_mutex);
  Counts after;
  const auto forgetAll = [&] {
    for (auto begin = numbers.begin(); begin != numbers.end();) {
      auto end = begin + 1;
      while (end != numbers.end() && *end <= *(end - 1) + 1) ++end;
      if (!forget(*begin, *(end - 1), after)) return false;
      begin = end;
    }
    return true;
  };
  const bool isDone = written([&] {
    after = _counts;
    return _database.execute("BEGIN IMMEDIATE") && forgetAll() && keepFacts(after) &&
           _database.execute("COMMIT");
  });
  if (isDone) _counts = after;
  return isDone;
}

bool EventQueue::settle() {
  const std::lock_guard lock(_mutex);
  if (_settled == _counts.newest) return true;
  if (!_database.sync()) return false;
  _settled = _counts.newest;
  return true;
}

EventQueue::Counts EventQueue::counts() const {
  const std::lock_guard lock(_mutex);
  return _counts;
}

std::string EventQueue::error() const {
  const std::lock_guard lock(_mutex);
  return _database.error();
}

}  // namespace qel::fleet
