#include "service/bus/BusClient.h"

#include <sys/socket.h>

#include <array>
#include <cerrno>

namespace qel::service {

BusClient::BusClient(std::shared_ptr<ServiceCore> core, const std::string& clientName,
                     std::function<void()> backlogBegins)
    : _core(std::move(core)) {
  std::array<int, 2> ends{};
  if (::socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC | SOCK_NONBLOCK, 0, ends.data()) != 0) {
    throw sdbus::createError(errno, "no socket for the event stream");
  }
  _clientEnd = sdbus::UnixFd(ends[1], sdbus::adopt_fd);
  _stream = std::make_shared<EventStream>(ends[0], std::move(backlogBegins));
  _session = _core->open(
      clientName, [stream = _stream](std::string_view eventName, const tesk::Message& event) {
        stream->send(eventName, event);
      });
}

BusClient::~BusClient() { _core->close(_session); }

}  // namespace qel::service
