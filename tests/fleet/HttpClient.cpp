#include "fleet/HttpClient.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <sys/time.h>
#include <unistd.h>

#include <array>
#include <cstdlib>

namespace qel::testing {
namespace {

constexpr timeval kPatience{30, 0};

// A connected socket, or -1.
int connectedTo(std::uint16_t port) {
  const int descriptor = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
  sockaddr_in server{};
  server.sin_family = AF_INET;
  server.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  server.sin_port = htons(port);
  ::setsockopt(descriptor, SOL_SOCKET, SO_RCVTIMEO, &kPatience, sizeof kPatience);
  if (::connect(descriptor, reinterpret_cast<const sockaddr*>(&server), sizeof server) == 0) {
    return descriptor;
  }
  ::close(descriptor);
  return -1;
}

}  // namespace

HttpAnswer http(std::uint16_t port, const std::string& method, const std::string& path,
                const std::vector<std::string>& headers) {
  const int descriptor = connectedTo(port);
  if (descriptor < 0) return {};
  std::string question = method + " " + path + " HTTP/1.1\r\n";
  for (const std::string& header : headers) question += header + "\r\n";
  question += "\r\n";
  ::send(descriptor, question.data(), question.size(), MSG_NOSIGNAL);
  std::string all;
  std::array<char, 65536> part{};
  ssize_t count = 0;
  while ((count = ::recv(descriptor, part.data(), part.size(), 0)) > 0) {
    all.append(part.data(), static_cast<std::size_t>(count));
  }
  ::close(descriptor);
  const auto end = all.find("\r\n\r\n");
  if (!all.starts_with("HTTP/1.1 ") || end == std::string::npos) return {};
  return {std::atoi(all.c_str() + std::string("HTTP/1.1 ").size()), all.substr(0, end + 2),
          all.substr(end + 4)};
}

RudeClient::RudeClient(std::uint16_t port, const std::string& said)
    : _descriptor(connectedTo(port)) {
  ::send(_descriptor, said.data(), said.size(), MSG_NOSIGNAL);
}

RudeClient::~RudeClient() { ::close(_descriptor); }

}  // namespace qel::testing
