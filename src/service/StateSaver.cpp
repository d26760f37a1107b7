#include "service/StateSaver.h"

#include <chrono>
#include <utility>

namespace qel::service {
namespace {

using namespace std::chrono_literals;

constexpr auto kPatience = 20ms;

}  // namespace

StateSaver::StateSaver(std::unique_ptr<StateKeeper> keeper, std::function<KeptState()> state,
                       sources::WaitClock& clock)
    : _keeper(std::move(keeper)),
      _state(std::move(state)),
      _clock(clock),
      _thread([this](const std::stop_token& stop) { run(stop); }) {}

StateSaver::~StateSaver() = default;

void StateSaver::changed(When when) {
  std::unique_lock lock(_mutex);
  const std::uint64_t change = ++_changes;
  if (when == When::now) {
    _isUrgent = true;
    _dozing.request_stop();
  }
  _moved.notify_all();
  if (when != When::now || _writing || _pausing) return;
  _moved.wait_for(lock, kPatience, [&] { return _pausing || _written >= change; });
}

bool StateSaver::waitForChange(const std::stop_token& stop) {
  std::stop_source dozing;
  {
    std::unique_lock lock(_mutex);
    const bool hasPaused = std::exchange(_pausing, false);
    if (hasPaused && _changes != _written) return true;
    if (!_moved.wait(lock, stop, [&] { return _changes != _written; })) return false;
    if (_isUrgent) return true;
    _dozing = dozing;
  }
  const std::stop_callback atTheEnd(stop, [&dozing] { dozing.request_stop(); });
  _clock.waitUntilMs(_clock.nowMs() + kPauseMs, dozing.get_token());
  return true;
}

void StateSaver::run(const std::stop_token& stop) {
  while (waitForChange(stop)) {
    std::uint64_t writing = 0;
    {
      const std::lock_guard lock(_mutex);
      writing = _changes;
      _writing = true;
      _isUrgent = false;
    }
    _keeper->save(_state());
    {
      const std::lock_guard lock(_mutex);
      _written = writing;
      _writing = false;
      _pausing = true;
    }
    _moved.notify_all();
    _clock.waitUntilMs(_clock.nowMs() + kPauseMs, stop);
  }
}

}  // namespace qel::service
