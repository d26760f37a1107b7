// Where a broker is: mqtt://HOST[:PORT], or mqtts://HOST[:PORT] over TLS.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace qel::fleet {

struct BrokerAddress {
  std::string host;
  std::uint16_t port = 0;
  bool isEncrypted = false;

  // As an URL.
  std::string text() const;
};

// Nothing for whatever else; `why` is then a few words, without a password that stands in the URL.
std::optional<BrokerAddress> brokerAddress(std::string_view url, std::string& why);

}  // namespace qel::fleet
