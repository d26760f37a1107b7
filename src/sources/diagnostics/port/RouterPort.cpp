#include "sources/diagnostics/port/RouterPort.h"

#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>

#include <algorithm>
#include <cerrno>

#include "sources/diagnostics/port/SystemTrouble.h"

namespace qel::diagnostics {
namespace {

constexpr int kMostPacketsOfATurn = 64;

}  // namespace

std::unique_ptr<DiagPort> RouterPort::open(const std::string& address, PortTrouble& trouble) {
  sockaddr_un name{};
  name.sun_family = AF_UNIX;
  if (address.size() > sizeof name.sun_path) {
    return trouble = {PortTrouble::Kind::failed, "name too long"}, nullptr;
  }
  std::copy(address.begin() + 1, address.end(), name.sun_path + 1);
  Descriptor socket(::socket(AF_UNIX, SOCK_SEQPACKET | SOCK_NONBLOCK | SOCK_CLOEXEC, 0));
  if (!socket) return trouble = systemTrouble(errno), nullptr;
  // The router has bound the whole address, so that a shorter one is another's.
  if (::connect(socket.number(), reinterpret_cast<const sockaddr*>(&name), sizeof name) != 0) {
    return trouble = systemTrouble(errno), nullptr;
  }
  return std::make_unique<RouterPort>(std::move(socket));
}

bool RouterPort::receive(const FrameReader::Take& take) {
  for (int i = 0; i < kMostPacketsOfATurn; ++i) {
    const ssize_t count = ::recv(descriptor(), _buffer.data(), _buffer.size(), MSG_TRUNC);
    if (count < 0) return errno == EAGAIN || errno == EINTR;
    if (count == 0 && hasEnded()) return false;
    const auto length = static_cast<std::size_t>(count);
    _counts.bytes += length;
    const bool isWhole = length > 0 && length <= _buffer.size();
    ++(isWhole ? _counts.frames : _counts.badFrames);
    if (isWhole) take(ByteView(_buffer).first(length));
  }
  return true;
}

// An empty message reads like the end.
bool RouterPort::hasEnded() const {
  pollfd socket{descriptor(), POLLRDHUP, 0};
  return ::poll(&socket, 1, 0) != 0;
}

bool RouterPort::send(const Request& request) {
  const ByteView packet = request.packet();
  return ::send(descriptor(), packet.data(), packet.size(), MSG_NOSIGNAL) ==
         static_cast<ssize_t>(packet.size());
}

}  // namespace qel::diagnostics
