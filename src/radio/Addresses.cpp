#include "radio/Addresses.h"

#include <arpa/inet.h>
#include <netinet/in.h>

#include <algorithm>
#include <array>

namespace qel {
namespace {

constexpr std::size_t kOfIPv4 = 4;
constexpr std::size_t kOfIPv6 = 16;
constexpr std::size_t kOfInterface = 8;

std::string textOf(int family, const std::uint8_t* bytes) {
  std::array<char, INET6_ADDRSTRLEN> text{};
  const char* made = inet_ntop(family, bytes, text.data(), text.size());
  return made ? made : "";
}

// The last bytes of an address, or all of them.
std::string textOfIPv6(ByteView end) {
  std::array<std::uint8_t, kOfIPv6> whole{};
  std::ranges::copy(end, whole.end() - static_cast<std::ptrdiff_t>(end.size()));
  return textOf(AF_INET6, whole.data());
}

}  // namespace

std::vector<std::string> addressTexts(ByteView bytes) {
  switch (bytes.size()) {
    case kOfIPv4:
      return {textOf(AF_INET, bytes.data())};
    case kOfInterface:
    case kOfIPv6:
      return {textOfIPv6(bytes)};
    case kOfInterface + kOfIPv4:
    case kOfIPv6 + kOfIPv4: {
      const auto first = bytes.first(bytes.size() - kOfIPv4);
      return {textOfIPv6(first), textOf(AF_INET, bytes.last(kOfIPv4).data())};
    }
    default:
      return {};
  }
}

}  // namespace qel
