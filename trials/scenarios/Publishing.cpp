// What may happen between the events and who receives them at a broker.

#include <unistd.h>

#include <csignal>
#include <thread>

#include "fleet/Broker.h"
#include "fleet/EventQueue.h"
#include "harness/Mounts.h"
#include "harness/Stand.h"
#include "scenarios/Scenarios.h"
#include "tools/RunningQelctl.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;
using testing::Broker;
using testing::eventually;
using testing::SureSubscriber;

// By its summary.
std::uint64_t lostBy(const Program& publisher) {
  const std::string said = publisher.errors();
  const auto end = said.find(" lost, which the disk did not take");
  if (end == std::string::npos) return 0;
  const auto begin = said.rfind(' ', end - 1) + 1;
  return std::stoull(said.substr(begin, end - begin));
}

// A service, one who publishes, a broker that keeps sessions, and one who receives.
class PublishingStand {
 public:
  // With its queue in that folder; empty: one of its own.
  explicit PublishingStand(Trial& trial, std::string state = {})
      : _figures(trial.figures),
        _stand(trial, {.screen = false, .source = "simulated,speed=20"}),
        _state(state.empty() ? _stand.directory() + "/publisher" : std::move(state)) {
    _publisher = _stand.start("publisher", {QEL_QELCTL, "publish", _broker.url(), "--state", _state,
                                            "--phone", "one", "--every", "20ms"});
    expectMore("at first");
    _broker.save();  // whoever receives stays known when the broker comes back
  }

  Broker& broker() { return _broker; }
  Program& publisher() { return *_publisher; }
  void startPublisher() { _publisher->process().start(); }

  // New events arrive.
  void expectMore(const std::string& after) {
    const bool isKept = _subscriber.receiveMore();
    promise(isKept, "events arrive " + after + "; it says " + _publisher->errors());
  }

  // What waited arrives, though nothing new comes.
  template <class Fault>
  void expectWaitingAfter(Fault fault) {
    const std::uint64_t before = _subscriber.newest();
    fault();
    const bool isKept = eventually([&] { return _subscriber.newest() > before + 20; });
    promise(isKept, "what waited arrives; it says " + _publisher->errors());
  }

  void expectWords(const std::string& words) {
    const auto isSaid = [&] { return _publisher->errors().find(words) != std::string::npos; };
    const bool isKept = eventually(isSaid);
    promise(isKept, "it says \"" + words + "\", and not only " + _publisher->errors());
  }

  // Of all numbers that were given none is missing but those that were never on the disk.
  void expectAll(bool isDiskFull = false) {
    _publisher->process().signal(SIGTERM);
    const bool endsWell = _publisher->process().waitForEnd() == 0;
    promise(endsWell, "it ends well: " + _publisher->errors());
    const std::uint64_t lost = lostBy(*_publisher);
    promise((lost > 0) == isDiskFull, "so many are lost: " + std::to_string(lost));
    std::string error;
    const auto queue = fleet::EventQueue::open(_state, {}, error);
    promise(queue != nullptr, "its queue can be opened: " + error);
    const auto counts = queue->counts();
    promise(counts.waiting == 0 && counts.dropped == 0,
            "none waits and none was dropped, not " + std::to_string(counts.waiting) + " and " +
                std::to_string(counts.dropped));
    const auto arrived = [this] { return _subscriber.events().size(); };
    const bool isComplete = eventually([&] { return arrived() + lost == counts.newest; });
    promise(isComplete, "all " + std::to_string(counts.newest) + " events arrive but " +
                            std::to_string(lost) + ", and not " + std::to_string(arrived()));
    _figures.remarks.push_back(std::to_string(arrived()) + " events, none missing" +
                               (lost > 0 ? ", " + std::to_string(lost) + " lost" : ""));
  }

 private:
  Figures& _figures;
  Stand _stand;
  const std::string _state;
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

// New events are lost then, and nothing that was on the disk.
void fullQueueDisk(Trial& trial) {
  for (int i = 0; i < trial.times; ++i) {
    const std::string name = "/tmp/qel-trial-queue-" + std::to_string(::getpid());
    const SmallDisk disk(name, 1024 * 1024);
    PublishingStand stand(trial, name);
    stand.broker().kill();
    std::this_thread::sleep_for(500ms);
    disk.fill();
    ++trial.figures.tried;
    stand.expectWords("; events are lost");
    stand.expectWaitingAfter([&stand] { stand.broker().start(); });
    disk.empty();
    stand.expectMore("once there is room again");
    stand.expectAll(true);
  }
}

}  // namespace qel::trials
