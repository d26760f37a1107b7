#include "fleet/ListenAddress.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>
#include <charconv>
#include <cstring>

namespace qel::fleet {
namespace {

struct SocketAddress {
  sockaddr_storage storage{};
  socklen_t size = 0;
};

SocketAddress socketAddress(const ListenAddress& address) {
  SocketAddress made;
  if (address.isIpv6) {
    sockaddr_in6 in{};
    in.sin6_family = AF_INET6;
    in.sin6_port = htons(address.port);
    ::inet_pton(AF_INET6, address.host.c_str(), &in.sin6_addr);
    std::memcpy(&made.storage, &in, made.size = sizeof in);
  } else {
    sockaddr_in in{};
    in.sin_family = AF_INET;
    in.sin_port = htons(address.port);
    ::inet_pton(AF_INET, address.host.c_str(), &in.sin_addr);
    std::memcpy(&made.storage, &in, made.size = sizeof in);
  }
  return made;
}

bool readHost(ListenAddress& address) {
  in6_addr ipv6{};
  in_addr ipv4{};
  if (address.isIpv6) {
    if (::inet_pton(AF_INET6, address.host.c_str(), &ipv6) != 1) return false;
    address.isLoopback = IN6_IS_ADDR_LOOPBACK(&ipv6);
    return true;
  }
  if (::inet_pton(AF_INET, address.host.c_str(), &ipv4) != 1) return false;
  address.isLoopback = ntohl(ipv4.s_addr) >> IN_CLASSA_NSHIFT == IN_LOOPBACKNET;
  return true;
}

}  // namespace

std::string ListenAddress::text() const {
  return (isIpv6 ? "[" + host + "]" : host) + ":" + std::to_string(port);
}

std::optional<ListenAddress> listenAddress(std::string_view text) {
  const auto colon = text.rfind(':');
  if (colon == std::string_view::npos) return std::nullopt;
  ListenAddress address;
  std::string_view host = text.substr(0, colon);
  address.isIpv6 = host.starts_with('[') && host.ends_with(']');
  if (address.isIpv6) host = host.substr(1, host.size() - 2);
  address.host = host;
  const std::string_view port = text.substr(colon + 1);
  const char* end = port.data() + port.size();
  const auto read = std::from_chars(port.data(), end, address.port);
  if (read.ec != std::errc() || read.ptr != end || !readHost(address)) return std::nullopt;
  return address;
}

std::string whyNotFree(const ListenAddress& address) {
  const SocketAddress there = socketAddress(address);
  const int descriptor = ::socket(there.storage.ss_family, SOCK_STREAM | SOCK_CLOEXEC, 0);
  if (descriptor < 0) return std::strerror(errno);
  const int yes = 1;
  ::setsockopt(descriptor, SOL_SOCKET, SO_REUSEADDR, &yes, sizeof yes);
  const auto* name = reinterpret_cast<const sockaddr*>(&there.storage);
  // Not listened to: nobody is to meet a server here that is about to go.
  const bool isFree = ::bind(descriptor, name, there.size) == 0;
  const std::string why = isFree ? "" : std::strerror(errno);
  ::close(descriptor);
  return why;
}

}  // namespace qel::fleet
