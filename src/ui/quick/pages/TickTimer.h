// Calls again what says itself when that is to be.
#pragma once

#include <QtCore/QTimer>
#include <algorithm>
#include <chrono>
#include <optional>

namespace qel {

// GUI thread only. Runs no timer while there is nothing to wait for. `Ticking` has untilNextTick()
// and tick().
template <typename Ticking>
class TickTimer {
 public:
  explicit TickTimer(Ticking& ticking) : _ticking(ticking) {
    _timer.setSingleShot(true);
    QObject::connect(&_timer, &QTimer::timeout, &_timer, [this] {
      _ticking.tick();
      arm();
    });
  }

  // To be called after everything that may have changed the answer.
  void arm() {
    using namespace std::chrono_literals;
    const auto until = _ticking.untilNextTick();
    if (!until) return _timer.stop();
    _timer.start(std::max<std::chrono::milliseconds>(0ms, *until));
  }

 private:
  Ticking& _ticking;
  QTimer _timer;
};

}  // namespace qel
