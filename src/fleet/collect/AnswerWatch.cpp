#include "fleet/collect/AnswerWatch.h"

#include <sys/socket.h>

#include <algorithm>
#include <utility>

namespace qel::fleet {
namespace {

using namespace std::chrono_literals;

constexpr auto kGrace = 5s;
constexpr auto kEndPatience = 10s;
constexpr auto kBetweenLooks = 200ms;

}  // namespace

AnswerWatch::AnswerWatch(AnswerPatience patience)
    : _patience(std::move(patience)),
      _thread([this](const std::stop_token& stop) { watch(stop); }) {}

void AnswerWatch::expect(int socket) {
  const std::lock_guard lock(_mutex);
  _socket = socket;
  _deadline = Clock::now() + _patience.statement + kGrace;
  _changed.notify_one();
}

void AnswerWatch::answered() {
  const std::lock_guard lock(_mutex);
  _socket = -1;
}

bool AnswerWatch::hasGivenUp() const {
  const std::lock_guard lock(_mutex);
  return _hasGivenUp;
}

void AnswerWatch::watch(const std::stop_token& stop) {
  std::unique_lock lock(_mutex);
  while (_changed.wait(lock, stop, [this] { return _socket >= 0; }) && !stop.stop_requested()) {
    _changed.wait_for(lock, stop, kBetweenLooks, [this] { return _socket < 0; });
    if (_socket >= 0) look();
  }
}

void AnswerWatch::look() {
  const auto now = Clock::now();
  if (!_end && _patience.isToEnd()) _end = now + kEndPatience;
  if (now < (_end ? std::min(*_end, _deadline) : _deadline)) return;
  ::shutdown(_socket, SHUT_RDWR);
  _socket = -1;
  _hasGivenUp = true;
}

}  // namespace qel::fleet
