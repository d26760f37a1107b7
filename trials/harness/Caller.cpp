#include "harness/Caller.h"

#include <sdbus-c++/sdbus-c++.h>

#include <algorithm>
#include <utility>

#include "harness/Proxy.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr auto kPause = 10ms;
constexpr auto kPatience = 60s;

milliseconds since(Clock::time_point time) {
  return std::chrono::ceil<milliseconds>(Clock::now() - time);
}

// Calls of a proxy of the bus itself or of the service.
class Question {
 public:
  Question(sdbus::IConnection& connection, Caller::Asked asked) {
    if (asked == Caller::Asked::bus) {
      _bus = sdbus::createProxy(connection, "org.freedesktop.DBus", "/org/freedesktop/DBus");
      return;
    }
    _service = std::make_unique<Proxy>(connection);
    _events = _service->Register("trial-caller");
  }

  void ask() {
    if (_bus) {
      std::string identity;
      _bus->callMethod("GetId").onInterface("org.freedesktop.DBus").storeResultsTo(identity);
    } else {
      _service->PerformCommand("kCommandQueryMetric", {});
    }
  }

 private:
  std::unique_ptr<sdbus::IProxy> _bus;
  std::unique_ptr<Proxy> _service;
  sdbus::UnixFd _events;
};

}  // namespace

Caller::Caller(std::string busAddress, Asked asked)
    : _busAddress(std::move(busAddress)), _asked(asked), _thread([this] { run(); }) {}

Caller::~Caller() {
  _stopping = true;
  _thread.join();
}

milliseconds Caller::longestWait() {
  const std::lock_guard lock(_mutex);
  const auto waiting = _asking ? since(_askedAt) : 0ms;
  return std::max(std::exchange(_longest, 0ms), waiting);
}

// Without a service there is nobody to wait for: it tries again a moment later.
void Caller::run() {
  while (!_stopping) {
    try {
      ask();
    } catch (const sdbus::Error&) {
      const std::lock_guard lock(_mutex);
      _asking = false;
    }
    std::this_thread::sleep_for(kPause);
  }
}

void Caller::ask() {
  const auto connection = tesk::bus::connectTo({_busAddress});
  connection->setMethodCallTimeout(kPatience);
  Question question(*connection, _asked);
  while (!_stopping) {
    const auto askedAt = Clock::now();
    {
      const std::lock_guard lock(_mutex);
      _askedAt = askedAt;
      _asking = true;
    }
    question.ask();
    note(askedAt);
    std::this_thread::sleep_for(kPause);
  }
}

void Caller::note(Clock::time_point askedAt) {
  ++_answers;
  const std::lock_guard lock(_mutex);
  _longest = std::max(_longest, since(askedAt));
  _asking = false;
}

}  // namespace qel::trials
