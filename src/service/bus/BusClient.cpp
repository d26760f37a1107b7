#include "service/bus/BusClient.h"

#include <sys/socket.h>

#include <array>
#include <cerrno>

#include "tesk/bus/EventPacket.h"

namespace qel::service {
namespace {

constexpr int kSocketBuffer = 64 * 1024;
static_assert(kSocketBuffer >= static_cast<int>(tesk::bus::kLargestPacket));

}  // namespace

BusClient::BusClient(std::shared_ptr<ServiceCore> core, const std::string& clientName,
                     std::function<void()> backlogBegins, std::shared_ptr<Backlogs> backlogs)
    : _core(std::move(core)) {
  std::array<int, 2> ends{};
  if (::socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC | SOCK_NONBLOCK, 0, ends.data()) != 0) {
    throw sdbus::createError(errno, "no socket for the event stream");
  }
  _clientEnd = sdbus::UnixFd(ends[1], sdbus::adopt_fd);
  // Unread events are memory of the service, in the kernel too. It doubles the number.
  ::setsockopt(ends[0], SOL_SOCKET, SO_SNDBUF, &kSocketBuffer, sizeof kSocketBuffer);
  _stream = std::make_shared<EventStream>(ends[0], std::move(backlogBegins), std::move(backlogs));
  _session = _core->open(
      clientName, [stream = _stream](std::string_view eventName, const tesk::Message& event) {
        stream->send(eventName, event);
      });
}

BusClient::~BusClient() { _core->close(_session); }

}  // namespace qel::service
