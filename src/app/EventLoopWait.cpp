#include "app/EventLoopWait.h"

#include <QtCore/QMetaObject>
#include <QtCore/QTimer>

namespace qel {

EventLoopWait::EventLoopWait(std::optional<std::chrono::milliseconds> patience)
    : _patience(patience) {}

void EventLoopWait::wait() {
  QEventLoop loop;
  {
    const std::lock_guard lock(_mutex);
    if (_woken) return;
    _loop = &loop;
  }
  if (_patience) QTimer::singleShot(*_patience, &loop, &QEventLoop::quit);
  loop.exec();
  const std::lock_guard lock(_mutex);
  _loop = nullptr;
}

void EventLoopWait::wake() {
  const std::lock_guard lock(_mutex);
  _woken = true;
  if (_loop) QMetaObject::invokeMethod(_loop, &QEventLoop::quit, Qt::QueuedConnection);
}

}  // namespace qel
