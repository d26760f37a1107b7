#include "tesk/bus/BusTransport.h"

#include <poll.h>

#include <algorithm>
#include <condition_variable>
#include <future>
#include <mutex>
#include <optional>
#include <utility>
#include <vector>

#include "base/PollTimeout.h"
#include "base/WakeUp.h"
#include "tesk/bus/BusLink.h"
#include "tesk/bus/Reasons.h"

namespace tesk::bus {
namespace {

using namespace std::chrono_literals;

constexpr std::chrono::milliseconds kFirstPause = 250ms;
constexpr std::chrono::milliseconds kLongestPause = 2s;
constexpr std::chrono::milliseconds kConnectingTakes = 500ms;

// Waits and does nothing else.
class PlainWait final : public AnswerWait {
 public:
  void wait() override { _woken.get_future().wait(); }
  void wake() override { _woken.set_value(); }

 private:
  std::promise<void> _woken;
};

// What a command came to, between the two threads.
class Outcome {
 public:
  explicit Outcome(std::shared_ptr<AnswerWait> wait) : _wait(std::move(wait)) {}

  void answer(CommandResult result, Message reply) {
    {
      const std::lock_guard lock(_mutex);
      _result = std::move(result);
      _reply = std::move(reply);
    }
    _wait->wake();
  }

  bool isAbandoned() {
    const std::lock_guard lock(_mutex);
    return _abandoned;
  }

  CommandResult waitFor(Message& reply) {
    _wait->wait();
    const std::lock_guard lock(_mutex);
    _abandoned = true;
    if (!_result) return {kServiceUnreachable, std::string(kNoAnswer)};
    reply = std::move(_reply);
    return std::move(*_result);
  }

 private:
  const std::shared_ptr<AnswerWait> _wait;
  std::mutex _mutex;
  std::optional<CommandResult> _result;
  Message _reply;
  bool _abandoned = false;
};

}  // namespace

// The thread's loop: connect to the bus, live with that connection until it is lost, pause, again.
class BusTransport::Worker {
 public:
  // Runs on the thread; without a link there is no bus.
  using Task = std::function<void(BusLink* link)>;

  Worker(BusAddress address, std::string clientName, EventSink sink, ReachabilityObserver observer,
         ConditionObserver conditionObserver, std::chrono::milliseconds rest)
      : _address(std::move(address)),
        _clientName(std::move(clientName)),
        _sink(std::move(sink)),
        _observer(std::move(observer)),
        _conditionObserver(std::move(conditionObserver)),
        _rest(rest) {}

  void run() {
    auto pause = kFirstPause;
    while (!isStopping()) {
      try {
        setConnecting(true);
        BusLink link(_address, _clientName, _sink, _deliver, _conditionObserver, _rest);
        setConnecting(false);
        pause = kFirstPause;
        live(link);
      } catch (const sdbus::Error&) {
        // No bus, or it is gone: again after a pause. A failed attempt costs some memory inside the
        // bus library, so the pauses grow.
      }
      setConnecting(false);
      if (isStopping()) break;
      tell(false, std::string(kNoBus));
      waitWithoutBus(pause);
      pause = std::min(pause * 2, kLongestPause);
    }
    runTasks(nullptr);
    const std::lock_guard lock(_mutex);
    _ended = true;
    _changed.notify_all();
  }

  void post(Task task) {
    {
      const std::lock_guard lock(_mutex);
      _tasks.push_back(std::move(task));
    }
    _wakeUp.signal();
  }

  // The thread only.
  void setDelivery(BusLink* link, bool on) {
    _deliver = on;
    if (link) link->setDelivery(on);
  }

  void stop() {
    {
      const std::lock_guard lock(_mutex);
      _stopping = true;
    }
    _wakeUp.signal();
  }

  // After stop(). False when the thread may still be a long time: a bus that takes a connection and
  // says nothing holds it up, where it does nothing that anybody could notice.
  bool endsSoon() {
    std::unique_lock lock(_mutex);
    _changed.wait_for(lock, kConnectingTakes, [this] { return _ended; });
    _changed.wait(lock, [this] { return _ended || _connecting; });
    return _ended;
  }

 private:
  bool isStopping() {
    const std::lock_guard lock(_mutex);
    return _stopping;
  }

  void setConnecting(bool connecting) {
    const std::lock_guard lock(_mutex);
    _connecting = connecting;
    _changed.notify_all();
  }

  void live(BusLink& link) {
    while (!isStopping()) {
      runTasks(&link);
      if (const auto now = link.reachability()) tell(now->reachable, now->why);
      if (link.waitAndProcess(_wakeUp.descriptor())) _wakeUp.clear();
    }
  }

  void waitWithoutBus(std::chrono::milliseconds pause) {
    const auto end = std::chrono::steady_clock::now() + pause;
    while (!isStopping()) {
      runTasks(nullptr);
      const int left = qel::pollTimeout(end);
      if (left == 0) return;
      pollfd waited{_wakeUp.descriptor(), POLLIN, 0};
      ::poll(&waited, 1, left);
      _wakeUp.clear();
    }
  }

  void runTasks(BusLink* link) {
    std::vector<Task> tasks;
    {
      const std::lock_guard lock(_mutex);
      tasks.swap(_tasks);
    }
    for (const Task& task : tasks) task(link);
  }

  void tell(bool reachable, const std::string& why) {
    if (_told && _told->first == reachable && _told->second == why) return;
    _told.emplace(reachable, why);
    if (_observer) _observer(reachable, why);
  }

  const BusAddress _address;
  const std::string _clientName;
  const EventSink _sink;
  const ReachabilityObserver _observer;
  const ConditionObserver _conditionObserver;
  const std::chrono::milliseconds _rest;
  const qel::WakeUp _wakeUp;
  std::mutex _mutex;
  std::condition_variable _changed;
  std::vector<Task> _tasks;
  bool _stopping = false;
  bool _connecting = false;
  bool _ended = false;
  // The thread only.
  bool _deliver = false;  // whenever there is a link
  std::optional<std::pair<bool, std::string>> _told;
};

BusTransport::BusTransport(BusAddress address, std::string clientName, EventSink sink,
                           ReachabilityObserver observer, AnswerWaitMaker makeWait,
                           ConditionObserver conditionObserver, std::chrono::milliseconds rest)
    : _makeWait(std::move(makeWait)),
      _worker(std::make_shared<Worker>(std::move(address), std::move(clientName), std::move(sink),
                                       std::move(observer), std::move(conditionObserver), rest)),
      _thread([worker = _worker] { worker->run(); }) {}

BusTransport::~BusTransport() {
  _worker->stop();
  const bool withinEvent = _thread.get_id() == std::this_thread::get_id();
  if (withinEvent || !_worker->endsSoon()) {
    _thread.detach();
  } else {
    _thread.join();
  }
}

CommandResult BusTransport::performCommand(std::string_view command, const Message& request,
                                           Message& reply) {
  const auto outcome =
      std::make_shared<Outcome>(_makeWait ? _makeWait() : std::make_shared<PlainWait>());
  BusLink::Command order{std::string(command), request,
                         [outcome](CommandResult result, Message answer) {
                           outcome->answer(std::move(result), std::move(answer));
                         },
                         [outcome] { return outcome->isAbandoned(); }};
  _worker->post([order = std::move(order)](BusLink* link) {
    if (!link) return order.answer({kServiceUnreachable, std::string(kNoBus)}, {});
    link->performCommand(order);
  });
  return outcome->waitFor(reply);
}

void BusTransport::eventsOn() {
  _worker->post([worker = _worker.get()](BusLink* link) { worker->setDelivery(link, true); });
}

void BusTransport::eventsOff() {
  _worker->post([worker = _worker.get()](BusLink* link) { worker->setDelivery(link, false); });
}

}  // namespace tesk::bus
