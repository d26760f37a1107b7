#include "ui/quick/pages/BootTimer.h"

#include <sys/timerfd.h>
#include <unistd.h>

#include <algorithm>
#include <cstdint>

namespace qel {

BootTimer::BootTimer(QObject* parent)
    : QObject(parent),
      _descriptor(::timerfd_create(CLOCK_BOOTTIME, TFD_NONBLOCK | TFD_CLOEXEC)),
      _notifier(QSocketNotifier::Read) {
  _plain.setSingleShot(true);
  connect(&_plain, &QTimer::timeout, this, &BootTimer::fire);
  connect(&_notifier, &QSocketNotifier::activated, this, &BootTimer::fire);
  if (_descriptor < 0) return;
  _notifier.setSocket(_descriptor);
  _notifier.setEnabled(true);
}

BootTimer::~BootTimer() {
  _notifier.setEnabled(false);
  if (_descriptor >= 0) ::close(_descriptor);
}

void BootTimer::start(std::chrono::milliseconds wait) {
  using namespace std::chrono_literals;
  _isActive = true;
  set(std::max(wait, 1ms));  // 0 would stop it
}

void BootTimer::stop() {
  if (!_isActive) return;
  _isActive = false;
  set(std::chrono::milliseconds(0));
}

void BootTimer::set(std::chrono::milliseconds wait) {
  if (_descriptor < 0) {
    if (wait.count() == 0) return _plain.stop();
    return _plain.start(wait);
  }
  const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(wait);
  itimerspec spec{};
  spec.it_value.tv_sec = seconds.count();
  const auto rest = std::chrono::nanoseconds(wait - seconds).count();
  spec.it_value.tv_nsec = static_cast<decltype(spec.it_value.tv_nsec)>(rest);
  ::timerfd_settime(_descriptor, 0, &spec, nullptr);
}

void BootTimer::fire() {
  std::uint64_t times = 0;
  if (_descriptor >= 0 && ::read(_descriptor, &times, sizeof(times)) < 0) return;  // set anew
  _isActive = false;
  emit timeout();
}

}  // namespace qel
