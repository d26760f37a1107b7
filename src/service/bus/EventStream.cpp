#include "service/bus/EventStream.h"

#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>
#include <utility>

#include "tesk/bus/EventPacket.h"

namespace qel::service {

EventStream::EventStream(int descriptor, std::function<void()> backlogBegins,
                         std::shared_ptr<Backlogs> backlogs)
    : _descriptor(descriptor),
      _backlogBegins(std::move(backlogBegins)),
      _backlogs(std::move(backlogs)) {
  const std::lock_guard lock(_backlogs->mutex());
  _backlogs->add(_backlog);
}

EventStream::~EventStream() {
  {
    const std::lock_guard lock(_backlogs->mutex());
    _backlogs->remove(_backlog);
  }
  ::close(_descriptor);
}

EventStream::Written EventStream::write(ByteView packet) const {
  while (true) {
    const ssize_t sent =
        ::send(_descriptor, packet.data(), packet.size(), MSG_DONTWAIT | MSG_NOSIGNAL);
    if (sent >= 0) return Written::yes;
    if (errno == EINTR) continue;
    return errno == EAGAIN || errno == ENOBUFS ? Written::full : Written::broken;
  }
}

void EventStream::send(std::string_view eventName, const tesk::Message& event) {
  auto packet = tesk::bus::encodeEvent(eventName, event);
  bool begins = false;
  {
    const std::lock_guard lock(_backlogs->mutex());
    if (_broken) return;
    if (!packet) {
      ++_backlog.dropped;
      return;
    }
    const Written written = _backlog.packets.empty() ? write(*packet) : Written::full;
    if (written == Written::yes) return;
    _broken = written == Written::broken;
    begins = _broken || _backlog.packets.empty();
    if (!_broken) _backlogs->push(_backlog, std::move(*packet));
  }
  if (begins) _backlogBegins();
}

short EventStream::pollEvents() const {
  const std::lock_guard lock(_backlogs->mutex());
  return static_cast<short>(POLLIN | (_backlog.packets.empty() ? 0 : POLLOUT));
}

void EventStream::flush() {
  const std::lock_guard lock(_backlogs->mutex());
  while (!_backlog.packets.empty() && !_broken) {
    const Written written = write(_backlog.packets.front());
    if (written == Written::full) return;
    _broken = written == Written::broken;
    _backlogs->pop(_backlog);
  }
}

bool EventStream::isBroken() const {
  const std::lock_guard lock(_backlogs->mutex());
  return _broken;
}

std::uint64_t EventStream::dropped() const {
  const std::lock_guard lock(_backlogs->mutex());
  return _backlog.dropped;
}

}  // namespace qel::service
