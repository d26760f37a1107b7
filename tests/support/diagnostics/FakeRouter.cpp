#include "support/diagnostics/FakeRouter.h"

#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <stdexcept>
#include <utility>

namespace qel::diagnostics::test {
namespace {

std::string ownName() {
  static std::atomic<int> count = 0;
  return "@qel-router-" + std::to_string(::getpid()) + "-" + std::to_string(++count);
}

}  // namespace

FakeRouter::FakeRouter(ModemBrain brain)
    : _address(ownName()),
      _listener(::socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0)),
      _brain(std::move(brain)) {
  sockaddr_un name{};
  name.sun_family = AF_UNIX;
  std::copy(_address.begin() + 1, _address.end(), name.sun_path + 1);
  // The whole address, zeros and all.
  if (::bind(_listener, reinterpret_cast<const sockaddr*>(&name), sizeof name) != 0 ||
      ::listen(_listener, 4) != 0) {
    throw std::runtime_error("no router's socket");
  }
  _thread = std::thread([this] { play(); });
}

FakeRouter::~FakeRouter() {
  {
    const std::lock_guard lock(_mutex);
    _ending = true;
  }
  _wakeUp.signal();
  _thread.join();
  for (const int client : _clients) ::close(client);
  ::close(_listener);
}

void FakeRouter::send(ByteView packet) {
  const std::lock_guard lock(_mutex);
  for (const int client : _clients) ::send(client, packet.data(), packet.size(), MSG_NOSIGNAL);
}

void FakeRouter::play() {
  while (true) {
    std::vector<pollfd> waited{{_wakeUp.descriptor(), POLLIN, 0}, {_listener, POLLIN, 0}};
    {
      const std::lock_guard lock(_mutex);
      if (_ending) return;
      for (const int client : _clients) waited.push_back({client, POLLIN, 0});
    }
    ::poll(waited.data(), waited.size(), -1);
    _wakeUp.clear();
    for (std::size_t i = waited.size() - 1; i >= 2; --i) {
      if (waited[i].revents != 0) receive(i - 2);
    }
    if (waited[1].revents == 0) continue;
    const std::lock_guard lock(_mutex);
    _clients.push_back(::accept4(_listener, nullptr, nullptr, SOCK_CLOEXEC));
  }
}

void FakeRouter::receive(std::size_t client) {
  std::array<std::uint8_t, 4096> request;
  const ssize_t count = ::recv(_clients[client], request.data(), request.size(), 0);
  const std::lock_guard lock(_mutex);
  if (count <= 0) {
    ::close(_clients[client]);
    _clients.erase(_clients.begin() + static_cast<std::ptrdiff_t>(client));
    return;
  }
  for (const Bytes& answer :
       _brain.answersTo(ByteView(request).first(static_cast<std::size_t>(count)))) {
    for (const int taker : _clients) ::send(taker, answer.data(), answer.size(), MSG_NOSIGNAL);
  }
}

}  // namespace qel::diagnostics::test
