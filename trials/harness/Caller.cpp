#include "harness/Caller.h"

#include <sdbus-c++/sdbus-c++.h>

#include "harness/Proxy.h"

namespace qel::trials {
namespace {

using namespace std::chrono_literals;

constexpr auto kPause = 10ms;
constexpr auto kPatience = 60s;

milliseconds since(Clock::time_point time) {
  return std::chrono::ceil<milliseconds>(Clock::now() - time);
}

}  // namespace

Caller::Caller(std::string busAddress)
    : _busAddress(std::move(busAddress)), _thread([this] { run(); }) {}

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
  Proxy proxy(*connection);
  const auto events = proxy.Register("trial-caller");
  const std::map<std::string, sdbus::Variant> request;
  while (!_stopping) {
    {
      const std::lock_guard lock(_mutex);
      _askedAt = Clock::now();
      _asking = true;
    }
    proxy.PerformCommand("kCommandQueryMetric", request);
    ++_answers;
    {
      const std::lock_guard lock(_mutex);
      _longest = std::max(_longest, since(_askedAt));
      _asking = false;
    }
    std::this_thread::sleep_for(kPause);
  }
}

}  // namespace qel::trials
