#include "service/bus/EventStream.h"

#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>

#include "tesk/bus/EventPacket.h"

namespace qel::service {
namespace {

// What a waiting packet costs beside its bytes.
constexpr std::size_t kPacketOverhead = 64;

std::size_t costOf(const Bytes& packet) { return packet.size() + kPacketOverhead; }

}  // namespace

EventStream::EventStream(int descriptor, std::function<void()> backlogBegins)
    : _descriptor(descriptor), _backlogBegins(std::move(backlogBegins)) {}

EventStream::~EventStream() { ::close(_descriptor); }

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
    const std::lock_guard lock(_mutex);
    if (_broken) return;
    if (!packet) {
      ++_dropped;
      return;
    }
    const Written written = _backlog.empty() ? write(*packet) : Written::full;
    if (written == Written::yes) return;
    _broken = written == Written::broken;
    begins = _broken || _backlog.empty();
    if (!_broken) keep(std::move(*packet));
  }
  if (begins) _backlogBegins();
}

void EventStream::keep(Bytes packet) {
  _backlogBytes += costOf(packet);
  _backlog.push_back(std::move(packet));
  while (_backlogBytes > kLargestBacklog) {
    _backlogBytes -= costOf(_backlog.front());
    _backlog.pop_front();
    ++_dropped;
  }
}

short EventStream::pollEvents() const {
  const std::lock_guard lock(_mutex);
  return static_cast<short>(POLLIN | (_backlog.empty() ? 0 : POLLOUT));
}

void EventStream::flush() {
  const std::lock_guard lock(_mutex);
  while (!_backlog.empty() && !_broken) {
    const Written written = write(_backlog.front());
    if (written == Written::full) return;
    _broken = written == Written::broken;
    _backlogBytes -= costOf(_backlog.front());
    _backlog.pop_front();
  }
}

bool EventStream::isBroken() const {
  const std::lock_guard lock(_mutex);
  return _broken;
}

std::uint64_t EventStream::dropped() const {
  const std::lock_guard lock(_mutex);
  return _dropped;
}

}  // namespace qel::service
