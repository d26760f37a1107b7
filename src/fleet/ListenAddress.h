// Where a server of this program listens: ADDRESS:PORT, with an IPv6 address in brackets.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace qel::fleet {

struct ListenAddress {
  std::string host;        // an address as numbers, without brackets
  std::uint16_t port = 0;  // 0: any that is free
  bool isIpv6 = false;
  bool isLoopback = false;  // nobody outside of this machine reaches it

  std::string text() const;  // ADDRESS:PORT
};

// Nothing for whatever else, names too.
std::optional<ListenAddress> listenAddress(std::string_view text);

// Why nobody can listen there, in a few words of the system; empty: somebody can.
std::string whyNotFree(const ListenAddress& address);

}  // namespace qel::fleet
