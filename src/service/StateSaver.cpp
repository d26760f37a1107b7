#include "service/StateSaver.h"

#include <chrono>
#include <utility>

namespace qel::service {
namespace {

using namespace std::chrono_literals;

constexpr auto kPatience = 20ms;

}  // namespace

StateSaver::StateSaver(std::unique_ptr<StateKeeper> keeper, std::function<KeptState()> state,
                       WaitClock& clock)
    : _keeper(std::move(keeper)),
      _state(std::move(state)),
      _clock(clock),
      _thread([this](const std::stop_token& stop) { run(stop); }) {}

StateSaver::~StateSaver() = default;

void StateSaver::changed() {
  std::unique_lock lock(_mutex);
  const std::uint64_t change = ++_changes;
  _moved.notify_all();
  _moved.wait_for(lock, kPatience, [&] { return _pausing || _written >= change; });
}

void StateSaver::run(const std::stop_token& stop) {
  while (true) {
    std::uint64_t writing = 0;
    {
      std::unique_lock lock(_mutex);
      _pausing = false;
      if (!_moved.wait(lock, stop, [&] { return _changes != _written; })) return;
      writing = _changes;
    }
    _keeper->save(_state());
    {
      const std::lock_guard lock(_mutex);
      _written = writing;
      _pausing = true;
    }
    _moved.notify_all();
    _clock.waitUntilMs(_clock.nowMs() + kPauseMs, stop);
  }
}

}  // namespace qel::service
