// The database of a fleet.
#pragma once

#include <cstdint>
#include <memory>
#include <set>
#include <span>
#include <string>
#include <vector>

#include "base/Clock.h"
#include "fleet/collect/AnswerWatch.h"
#include "fleet/collect/DatabaseTrouble.h"
#include "fleet/collect/PhoneMessage.h"

namespace qel::fleet {

class WatchedConnection;

struct StoredCounts {
  std::uint64_t stored = 0;   // events
  std::uint64_t again = 0;    // that were there before
  std::uint64_t faulty = 0;   // of the stored ones, without a row in a table of their own
  std::uint64_t refused = 0;  // that the database does not take in any form
};

// One connection, one thread. With the collector's rights alone, whoever logs in.
class FleetDatabase {
 public:
  // Nothing when it cannot be used. The address is of databaseAddress().
  static std::unique_ptr<FleetDatabase> open(const std::string& address,
                                             const AnswerPatience& patience,
                                             DatabaseTrouble& trouble,
                                             const Clock& clock = systemClock());
  ~FleetDatabase();
  FleetDatabase(const FleetDatabase&) = delete;
  FleetDatabase& operator=(const FleetDatabase&) = delete;

  // All of them, committed; an event that is there already stays as it is. What the database does
  // not take for its content is stored as a fault, or left out, and keeps no other back. False:
  // nothing is certain, and this is of no use any more.
  bool store(std::span<const PhoneMessage> messages, StoredCounts& counts,
             DatabaseTrouble& trouble);

 private:
  FleetDatabase(const std::string& address, const AnswerPatience& patience, const Clock& clock);
  void checkLayout();
  void makeDays(std::span<const PhoneMessage> messages);
  void makeDay(std::int64_t day);
  void storeOrSplit(std::span<const PhoneMessage> messages, StoredCounts& counts);
  void storeWithoutContent(const PhoneMessage& message, StoredCounts& counts);
  void storeAll(std::span<const PhoneMessage> messages, StoredCounts& counts);

  const Clock& _clock;
  const std::unique_ptr<WatchedConnection> _connection;
  std::int64_t _today = 0;
  std::set<std::int64_t> _days;        // since 1970, that were asked for today
  std::set<std::string> _knownPhones;  // some of those in the table
};

}  // namespace qel::fleet
