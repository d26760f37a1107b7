// kill -9 between the events and who receives them at a broker.

#include <csignal>
#include <filesystem>
#include <set>
#include <thread>

#include "fleet/Broker.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"
#include "tools/RunningQelctl.h"

namespace qel::trials {
namespace {

using testing::Broker;
using testing::SureSubscriber;

// A service, one who publishes, a broker that keeps sessions, and one who receives.
class PublishingStand {
 public:
  explicit PublishingStand(Trial& trial)
      : _figures(trial.figures), _stand(trial, {.screen = false, .source = "simulated,speed=20"}) {
    _publisher = _stand.start(
        "publisher",
        {QEL_QELCTL, "publish", _broker.url(), "--bus", _stand.bus().address(), "--state",
         _stand.directory() + "/publisher", "--phone", "one", "--every", "20ms"});
    expectMore("at first");
    _broker.save();  // whoever receives stays known when the broker comes back
    const auto isSaved = [this] {
      return std::filesystem::exists(_stand.directory() + "/mosquitto.db");
    };
    promise(testing::eventually(isSaved), "the broker keeps its sessions");
  }

  Broker& broker() { return _broker; }
  Program& publisher() { return *_publisher; }
  void startPublisher() { _publisher->process().start(); }

  // New events arrive.
  void expectMore(const std::string& after) {
    promise(_subscriber.receiveMore(),
            "events arrive " + after + "; it says " + _publisher->errors());
  }

  // Nothing is missing, and what came twice is the same.
  void expectAll() {
    const auto numbers = _subscriber.numbers();
    const std::set<std::uint64_t> distinct(numbers.begin(), numbers.end());
    promise(*distinct.begin() == 1 && *distinct.rbegin() == distinct.size(),
            "no number is missing of " + std::to_string(*distinct.rbegin()) + ", there are " +
                std::to_string(distinct.size()));
    _figures.remarks.push_back(std::to_string(distinct.size()) + " events, none missing");
  }

 private:
  Figures& _figures;
  Stand _stand;
  Broker _broker{_stand.directory()};
  SureSubscriber _subscriber{_broker, _stand.directory() + "/received"};
  std::unique_ptr<Program> _publisher;
};

template <class Fault>
void repeatWhilePublishing(Trial& trial, const std::string& after, Fault fault) {
  PublishingStand stand(trial);
  for (int i = 0; i < trial.times; ++i) {
    std::this_thread::sleep_for(milliseconds(trial.below(300)));
    fault(stand);
    ++trial.figures.tried;
    stand.expectMore(after);
  }
  stand.expectAll();
}

}  // namespace

void killBroker(Trial& trial) {
  repeatWhilePublishing(trial, "after the broker was killed", [](PublishingStand& stand) {
    stand.broker().kill();
    stand.broker().start();
  });
}

void killPublisher(Trial& trial) {
  repeatWhilePublishing(trial, "after the publisher was killed", [](PublishingStand& stand) {
    stand.publisher().process().signal(SIGKILL);
    stand.publisher().process().waitForEnd();
    stand.startPublisher();
  });
}

}  // namespace qel::trials
