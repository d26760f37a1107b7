#include "fleet/BrokerAddress.h"

#include <algorithm>
#include <charconv>

namespace qel::fleet {
namespace {

constexpr std::string_view kPlain = "mqtt://";
constexpr std::string_view kEncrypted = "mqtts://";
constexpr std::uint16_t kPlainPort = 1883;
constexpr std::uint16_t kEncryptedPort = 8883;
constexpr std::size_t kLongestHost = 253;  // RFC 1035

bool isHost(std::string_view host, bool isBracketed) {
  const auto isPart = [isBracketed](char c) {
    const bool isPlain = (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') ||
                         (c >= 'A' && c <= 'Z') || c == '.' || c == '-' || c == '_';
    return isPlain || (isBracketed && (c == ':' || c == '%'));
  };
  return !host.empty() && host.size() <= kLongestHost && std::ranges::all_of(host, isPart);
}

std::optional<std::uint16_t> portOf(std::string_view digits) {
  std::uint16_t port = 0;
  const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), port);
  if (error != std::errc() || end != digits.data() + digits.size() || port == 0)
    return std::nullopt;
  return port;
}

// Takes the host off the front of the rest.
std::optional<std::string> takeHost(std::string_view& rest) {
  const bool isBracketed = rest.starts_with('[');
  const auto end = isBracketed ? rest.find(']') : std::min(rest.find(':'), rest.size());
  if (end == std::string_view::npos) return std::nullopt;
  const std::string_view host = isBracketed ? rest.substr(1, end - 1) : rest.substr(0, end);
  rest.remove_prefix(isBracketed ? end + 1 : end);
  if (!isHost(host, isBracketed)) return std::nullopt;
  return std::string(host);
}

}  // namespace

std::string BrokerAddress::text() const {
  const bool isBracketed = host.find(':') != std::string::npos;
  return std::string(isEncrypted ? kEncrypted : kPlain) + (isBracketed ? '[' + host + ']' : host) +
         ':' + std::to_string(port);
}

std::optional<BrokerAddress> brokerAddress(std::string_view url, std::string& why) {
  BrokerAddress address;
  address.isEncrypted = url.starts_with(kEncrypted);
  if (!address.isEncrypted && !url.starts_with(kPlain)) {
    why = "a broker is mqtt://HOST[:PORT] or mqtts://HOST[:PORT]";
    return std::nullopt;
  }
  url.remove_prefix((address.isEncrypted ? kEncrypted : kPlain).size());
  if (url.find('@') != std::string_view::npos) {
    why = "user and password stand in a file (--login), never in the URL";
    return std::nullopt;
  }
  if (url.ends_with('/')) url.remove_suffix(1);
  auto host = takeHost(url);
  if (!host) {
    why = "the URL names no host";
    return std::nullopt;
  }
  address.host = std::move(*host);
  address.port = address.isEncrypted ? kEncryptedPort : kPlainPort;
  if (url.empty()) return address;
  const auto port = url.starts_with(':') ? portOf(url.substr(1)) : std::nullopt;
  if (!port) {
    why = "after the host of the URL stands no port";
    return std::nullopt;
  }
  address.port = *port;
  return address;
}

}  // namespace qel::fleet
