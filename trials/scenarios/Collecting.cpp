// kill -9 between a broker and the tables of a fleet.

#include <array>
#include <csignal>
#include <memory>
#include <thread>

#include "fleet/Broker.h"
#include "fleet/collect/Postgres.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"
#include "support/Subprocess.h"
#include "tools/RunningQelctl.h"

namespace qel::trials {
namespace {

using testing::Broker;
using testing::Postgres;

// A service, one who publishes, a broker, two who collect, and a database.
class CollectingStand {
 public:
  explicit CollectingStand(Trial& trial)
      : _figures(trial.figures), _stand(trial, {.screen = false, .source = "simulated,speed=20"}) {
    const auto prepared = testing::run(
        QEL_QELCTL, {"collect", "--prepare", "--database", _database.address("owner")});
    promise(prepared.exitCode == 0, "the tables are made: " + prepared.err);
    _database.ask("GRANT qelwatch_collector TO collector");
    for (std::size_t i = 0; i < _collectors.size(); ++i) {
      const std::string name = "collector-" + std::to_string(i);
      _collectors[i] = std::make_unique<Program>(
          _stand.directory(), name,
          std::vector<std::string>{QEL_QELCTL, "collect", _broker.url(), "--database",
                                   _database.address(), "--name", name, "--every", "50ms"});
      promise(testing::eventually([&] { return !_collectors[i]->errors().empty(); }),
              name + " connects");
    }
    _publisher = _stand.start("publisher", {QEL_QELCTL, "publish", _broker.url(), "--state",
                                            _stand.directory() + "/publisher", "--phone", "one",
                                            "--every", "20ms", "--await-receiver"});
    expectMore("at first");
  }

  Broker& broker() { return _broker; }
  Postgres& database() { return _database; }
  Program& collector(std::size_t i) { return *_collectors[i % _collectors.size()]; }

  void expectMore(const std::string& after) {
    const long before = newest();
    promise(testing::eventually([&] { return newest() > before + 20; }),
            "events arrive " + after + "; they say " + _collectors[0]->errors() +
                _collectors[1]->errors());
  }

  // By SQL over their numbers: none is missing and none there twice, in both tables that tell.
  void expectAll() {
    _publisher->process().signal(SIGTERM);
    _publisher->process().waitForEnd();
    const auto missing = [this] {
      return _database.number("SELECT max(number) - count(DISTINCT number) FROM qelwatch.event");
    };
    promise(testing::eventually([&] { return missing() == 0; }),
            std::to_string(missing()) + " events are missing");
    promise(_database.number("SELECT count(*) - count(DISTINCT number) FROM qelwatch.event") == 0,
            "no event is there twice");
    promise(_database.number("SELECT count(*) - count(DISTINCT (r.number, r.list, r.entry)) FROM"
                             " qelwatch.lte_rsrp_rsrq_sinr AS r") == 0,
            "no report is there twice");
    promise(_database.number("SELECT count(*) FROM (SELECT number FROM qelwatch.event WHERE metric"
                             " = 'KCellularRsrpRsrqSinr' EXCEPT SELECT number FROM"
                             " qelwatch.lte_rsrp_rsrq_sinr) AS without") == 0,
            "every event has its report");
    _figures.remarks.push_back(std::to_string(newest()) + " events, none missing, none twice");
  }

 private:
  long newest() const {
    return _database.number("SELECT coalesce(max(number), 0) FROM qelwatch.event");
  }

  Figures& _figures;
  Stand _stand;
  Broker _broker{_stand.directory()};
  Postgres _database;
  std::array<std::unique_ptr<Program>, 2> _collectors;
  std::unique_ptr<Program> _publisher;
};

template <class Fault>
void repeatWhileCollecting(Trial& trial, const std::string& after, Fault fault) {
  if (!Postgres::isThere()) throw NotPossibleHere("PostgreSQL is not installed");
  CollectingStand stand(trial);
  for (int i = 0; i < trial.times; ++i) {
    std::this_thread::sleep_for(milliseconds(trial.below(300)));
    fault(stand, static_cast<std::size_t>(i));
    ++trial.figures.tried;
    stand.expectMore(after);
  }
  stand.expectAll();
}

}  // namespace

void killCollector(Trial& trial) {
  repeatWhileCollecting(trial, "after a collector was killed",
                        [](CollectingStand& stand, std::size_t i) {
                          testing::ChildProcess& process = stand.collector(i).process();
                          process.signal(SIGKILL);
                          process.waitForEnd();
                          process.start();
                        });
}

// It forgets who shares messages, and then keeps none for those who are still away.
void killBrokerOfCollectors(Trial& trial) {
  repeatWhileCollecting(trial, "after the broker was killed",
                        [](CollectingStand& stand, std::size_t) {
                          stand.broker().kill();
                          stand.broker().start();
                        });
}

void killDatabase(Trial& trial) {
  repeatWhileCollecting(trial, "after the database was killed",
                        [](CollectingStand& stand, std::size_t) {
                          stand.database().kill();
                          stand.database().start();
                        });
}

}  // namespace qel::trials
