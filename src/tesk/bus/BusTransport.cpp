#include "tesk/bus/BusTransport.h"

#include <poll.h>

#include <algorithm>
#include <deque>
#include <future>
#include <mutex>
#include <optional>

#include "tesk/bus/BusLink.h"
#include "tesk/bus/WakeUp.h"

namespace tesk::bus {
namespace {

using namespace std::chrono_literals;

constexpr std::chrono::milliseconds kFirstPause = 250ms;
constexpr std::chrono::milliseconds kLongestPause = 5s;

}  // namespace

// The thread's loop: connect to the bus, live with that connection until it is lost, pause, again.
class BusTransport::Worker {
 public:
  // Runs on the thread; without a link there is no bus.
  using Task = std::function<void(BusLink* link)>;

  Worker(BusAddress address, std::string clientName, EventSink sink, ReachabilityObserver observer)
      : _address(std::move(address)),
        _clientName(std::move(clientName)),
        _sink(std::move(sink)),
        _observer(std::move(observer)) {}

  void run() {
    auto pause = kFirstPause;
    while (!isStopping()) {
      try {
        BusLink link(_address, _clientName, _sink);
        pause = kFirstPause;
        live(link);
      } catch (const sdbus::Error&) {
        // No bus, or it is gone: again after a pause. A failed attempt costs some memory inside the
        // bus library, so the pauses grow.
      }
      tell(false, "no message bus");
      waitWithoutBus(pause);
      pause = std::min(pause * 2, kLongestPause);
    }
    runTasks(nullptr);
  }

  // Waits until the thread has run it.
  void perform(const Task& task) {
    std::promise<void> done;
    {
      const std::lock_guard lock(_mutex);
      _tasks.push_back([&](BusLink* link) {
        task(link);
        done.set_value();
      });
    }
    _wakeUp.signal();
    done.get_future().wait();
  }

  void stop() {
    {
      const std::lock_guard lock(_mutex);
      _stopping = true;
    }
    _wakeUp.signal();
  }

  // What delivery is to be whenever there is a link. The thread only.
  bool deliver = false;

 private:
  bool isStopping() {
    const std::lock_guard lock(_mutex);
    return _stopping;
  }

  void live(BusLink& link) {
    link.setDelivery(deliver);
    link.attach();
    while (!isStopping()) {
      runTasks(&link);
      tell(link.isAttached(), link.why());
      link.waitAndProcess(_wakeUp.descriptor());
      _wakeUp.clear();
    }
  }

  void waitWithoutBus(std::chrono::milliseconds pause) {
    const auto end = std::chrono::steady_clock::now() + pause;
    while (!isStopping()) {
      runTasks(nullptr);
      const auto left =
          std::chrono::ceil<std::chrono::milliseconds>(end - std::chrono::steady_clock::now());
      if (left.count() <= 0) return;
      pollfd waited{_wakeUp.descriptor(), POLLIN, 0};
      ::poll(&waited, 1, static_cast<int>(left.count()));
      _wakeUp.clear();
    }
  }

  void runTasks(BusLink* link) {
    std::deque<Task> tasks;
    {
      const std::lock_guard lock(_mutex);
      tasks.swap(_tasks);
    }
    for (const Task& task : tasks) task(link);
  }

  void tell(bool reachable, const std::string& why) {
    if (_told == reachable) return;
    _told = reachable;
    if (_observer) _observer(reachable, reachable ? std::string() : why);
  }

  const BusAddress _address;
  const std::string _clientName;
  const EventSink _sink;
  const ReachabilityObserver _observer;
  const WakeUp _wakeUp;
  std::mutex _mutex;
  std::deque<Task> _tasks;
  bool _stopping = false;
  std::optional<bool> _told;
};

BusTransport::BusTransport(BusAddress address, std::string clientName, EventSink sink,
                           ReachabilityObserver observer)
    : _worker(std::make_shared<Worker>(std::move(address), std::move(clientName), std::move(sink),
                                       std::move(observer))),
      _thread([worker = _worker] { worker->run(); }) {}

BusTransport::~BusTransport() {
  _worker->stop();
  if (_thread.get_id() == std::this_thread::get_id()) {
    _thread.detach();  // let go from within an event
  } else {
    _thread.join();
  }
}

CommandResult BusTransport::performCommand(std::string_view command, const Message& request,
                                           Message& reply) {
  CommandResult result{kServiceUnreachable, "no message bus"};
  _worker->perform([&](BusLink* link) {
    if (link) result = link->performCommand(command, request, reply);
  });
  return result;
}

void BusTransport::eventsOn() {
  _worker->perform([this](BusLink* link) {
    _worker->deliver = true;
    if (link) link->setDelivery(true);
  });
}

void BusTransport::eventsOff() {
  _worker->perform([this](BusLink* link) {
    _worker->deliver = false;
    if (link) link->setDelivery(false);
  });
}

}  // namespace tesk::bus
