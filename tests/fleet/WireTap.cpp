#include "fleet/WireTap.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <stdexcept>

namespace qel::testing {
namespace {

constexpr int kLookMs = 50;

sockaddr_in addressOf(std::uint16_t port) {
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  address.sin_port = htons(port);
  return address;
}

// Moves what there is. False at the end.
bool move(int from, int to, std::string& moved) {
  std::array<char, 65536> part;
  const ssize_t count = ::recv(from, part.data(), part.size(), 0);
  if (count <= 0) return false;
  moved.assign(part.data(), static_cast<std::size_t>(count));
  return ::send(to, part.data(), static_cast<std::size_t>(count), MSG_NOSIGNAL) == count;
}

}  // namespace

WireTap::WireTap(std::uint16_t server)
    : _server(server), _listener(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0)) {
  sockaddr_in address = addressOf(0);
  socklen_t size = sizeof address;
  auto* const general = reinterpret_cast<sockaddr*>(&address);
  if (::bind(_listener, general, size) != 0 || ::listen(_listener, 1) != 0 ||
      ::getsockname(_listener, general, &size) != 0) {
    throw std::runtime_error("no tap");
  }
  _port = ntohs(address.sin_port);
  _thread = std::thread([this] { run(); });
}

WireTap::~WireTap() {
  _ending = true;
  _thread.join();
  ::close(_listener);
}

std::string WireTap::sent() const {
  const std::lock_guard lock(_mutex);
  return _sent;
}

void WireTap::run() {
  while (!_ending) {
    pollfd waited{_listener, POLLIN, 0};
    if (::poll(&waited, 1, kLookMs) != 1) continue;
    const int client = ::accept4(_listener, nullptr, nullptr, SOCK_CLOEXEC);
    const int server = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    const sockaddr_in address = addressOf(_server);
    if (::connect(server, reinterpret_cast<const sockaddr*>(&address), sizeof address) == 0) {
      carry(client, server);
    }
    ::close(server);
    ::close(client);
  }
}

void WireTap::carry(int client, int server) {
  while (!_ending) {
    std::array<pollfd, 2> waited = {{{client, POLLIN, 0}, {server, POLLIN, 0}}};
    ::poll(waited.data(), waited.size(), kLookMs);
    std::string moved;
    if (waited[1].revents != 0 && !move(server, client, moved)) return;
    if (waited[0].revents == 0) continue;
    if (!move(client, server, moved)) return;
    const std::lock_guard lock(_mutex);
    _sent += moved;
  }
}

}  // namespace qel::testing
