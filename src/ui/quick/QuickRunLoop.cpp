#include "ui/quick/QuickRunLoop.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>
#include <algorithm>
#include <chrono>
#include <mutex>

#include "base/DispatchQueue.h"
#include "ui/kit/RunLoop.h"

namespace qel {
namespace {

constexpr std::size_t kBurst = 256;

}  // namespace

// Rung by any thread, also after the loop is gone.
class QuickRunLoop::Doorbell {
 public:
  explicit Doorbell(QObject* answers) : _answers(answers) {}

  void ring() {
    const std::lock_guard lock(_mutex);
    if (_answers) QCoreApplication::postEvent(_answers, new QEvent(QEvent::User));
  }

  void remove() {
    const std::lock_guard lock(_mutex);
    _answers = nullptr;
  }

 private:
  std::mutex _mutex;
  QObject* _answers;
};

QuickRunLoop::QuickRunLoop() : _doorbell(std::make_shared<Doorbell>(this)) {
  _timer.setSingleShot(true);
  connect(&_timer, &QTimer::timeout, this, [this] { fire(); });
  RunLoop::main().setObserver([this] { arm(); });
  arm();
  MainQueue::shared().setWaker([doorbell = _doorbell] { doorbell->ring(); });
  _doorbell->ring();
}

QuickRunLoop::~QuickRunLoop() {
  _doorbell->remove();
  RunLoop::main().setObserver({});
}

void QuickRunLoop::customEvent(QEvent* /*event*/) {
  if (MainQueue::shared().drain(kBurst)) _doorbell->ring();
  emit worked();
}

void QuickRunLoop::arm() {
  const auto due = RunLoop::main().nextDue();
  if (!due) return _timer.stop();
  const auto left = *due - std::chrono::steady_clock::now();
  const auto leftMs = std::chrono::ceil<std::chrono::milliseconds>(left);
  _timer.start(std::max(leftMs, std::chrono::milliseconds(0)));
}

void QuickRunLoop::fire() {
  RunLoop::main().fireDue(std::chrono::steady_clock::now());
  arm();
}

}  // namespace qel
