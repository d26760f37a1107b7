// Messages of phones, from a broker into a database.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "base/WakeUp.h"
#include "fleet/BrokerLink.h"
#include "fleet/Retries.h"
#include "fleet/collect/Batch.h"
#include "fleet/collect/FleetDatabase.h"

namespace qel::fleet {

struct CollectSettings {
  LinkSettings link;     // its client and subscription are set here
  std::string name;      // of this collector at the broker, which keeps messages for it
  std::string group;     // of those who share the messages
  std::string database;  // of databaseAddress()
  std::chrono::milliseconds patience{60'000};  // with a statement of its
  std::chrono::milliseconds every{500};        // how long a message waits for others
  std::size_t batch = 2000;                    // messages that are stored earlier
  std::chrono::seconds sessionAge{7 * 86400};  // how long the broker keeps messages for it
  bool keepsTrying = false;                    // also when broker or database refuses
};

struct CollectCounts {
  StoredCounts database;
  std::uint64_t broken = 0;  // messages that were none of a phone's
};

// Why it has ended by itself.
struct CollectEnd {
  bool isLayout = false;  // the tables are not those of this program
  std::string why;        // one line
};

// One thread. A message is acknowledged when what it says is committed; while the database is away
// there is no connection to the broker, and messages wait there.
class Collector {
 public:
  using Say = std::function<void(const std::string& line)>;

  Collector(CollectSettings settings, Say say);

  // Until told to end, which `wakeUp` says earlier, or there is no use in going on. Any thread may
  // ask whether it is to end.
  std::optional<CollectEnd> run(const std::function<bool()>& isToEnd, const WakeUp& wakeUp);
  const CollectCounts& counts() const { return _counts; }

 private:
  using Clock = std::chrono::steady_clock;

  void step(const WakeUp& wakeUp);
  void openDatabase();
  void loseDatabase(const DatabaseTrouble& trouble);
  void openLink();
  void loseLink(LinkFailure failure);
  void endLink();
  void turn(short revents);
  void storeBatch();
  bool keepBatch();
  void leave();
  void sayBroken();
  void sayOnce(const std::string& line);
  void wait(std::optional<Clock::time_point> until, const WakeUp& wakeUp);
  std::optional<Clock::time_point> nextTime() const;
  std::string broker() const { return _settings.link.broker.text() + ": "; }

  CollectSettings _settings;
  const Say _say;
  std::function<bool()> _isToEnd;
  std::unique_ptr<FleetDatabase> _database;
  std::unique_ptr<BrokerLink> _link;
  Retries _databaseRetries;
  // Some brokers forget who shares messages when they begin anew, and keep none for them.
  Retries _linkRetries{std::chrono::seconds(5)};
  bool _hadDatabase = false;
  bool _hadLink = false;
  Clock::time_point _lastTraffic;
  Batch _batch;
  CollectCounts _counts;
  std::uint64_t _brokenSaid = 0;
  std::optional<Clock::time_point> _nextBrokenLine;
  std::string _said;
  std::optional<CollectEnd> _end;
};

}  // namespace qel::fleet
