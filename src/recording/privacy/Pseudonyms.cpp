#include "recording/privacy/Pseudonyms.h"

#include <sys/random.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <vector>

#include "base/FatalError.h"
#include "recording/privacy/ImsiLayout.h"

namespace qel {
namespace {

// The first candidate that differs from the value. A byte alone comes out unchanged once in 256
// attempts.
template <class Value, class Candidate>
auto different(const Value& value, Candidate&& candidate) {
  constexpr std::uint8_t kMostAttempts = 16;
  auto result = candidate(std::uint8_t{0});
  for (std::uint8_t i = 1; i < kMostAttempts && std::ranges::equal(result, value); ++i) {
    result = candidate(i);
  }
  return result;
}

std::array<std::uint8_t, 4> bytesOf(std::uint32_t number) {
  return {static_cast<std::uint8_t>(number), static_cast<std::uint8_t>(number >> 8),
          static_cast<std::uint8_t>(number >> 16), static_cast<std::uint8_t>(number >> 24)};
}

std::uint32_t numberOf(ByteView bytes) {
  std::uint32_t number = 0;
  for (std::size_t i = 0; i < 4; ++i) number |= std::uint32_t{bytes[i]} << (8 * i);
  return number;
}

constexpr std::size_t kIPv4Bytes = 4;
constexpr std::size_t kInterfaceBytes = 8;
constexpr std::size_t kIPv6Bytes = 16;
constexpr std::uint8_t kPrivateIPv4 = 10;    // RFC 1918
constexpr std::uint8_t kPrivateIPv6 = 0xFD;  // RFC 4193

// The sizes of the addresses that stand one after the other in a field of that size: of a
// connection of both kinds by 24.008, clause 10.5.6.4, and by 24.301, clause 9.9.4.9.
std::vector<std::size_t> partsOf(std::size_t size) {
  if (size == kIPv4Bytes + kIPv6Bytes) return {kIPv4Bytes, kIPv6Bytes};
  if (size == kInterfaceBytes + kIPv4Bytes) return {kInterfaceBytes, kIPv4Bytes};
  return {size};
}

bool isNone(ByteView address) {
  return std::ranges::all_of(address, [](std::uint8_t byte) { return byte == 0; });
}

}  // namespace

Pseudonyms Pseudonyms::random() {
  SipKey key;
  ssize_t count = 0;
  do {
    count = ::getrandom(key.data(), key.size(), 0);
  } while (count < 0 && errno == EINTR);
  if (count != static_cast<ssize_t>(key.size())) fatalError("the system gives no random bytes");
  return Pseudonyms(key);
}

Bytes Pseudonyms::stream(Domain domain, ByteView value, std::uint8_t attempt,
                         std::size_t count) const {
  Bytes input = {static_cast<std::uint8_t>(domain), attempt, 0, 0, 0, 0};
  input.insert(input.end(), value.begin(), value.end());
  Bytes out;
  for (std::uint32_t block = 0; out.size() < count; ++block) {
    std::ranges::copy(bytesOf(block), input.begin() + 2);
    const std::uint64_t word = sipHash24(_key, input);
    for (int i = 0; i < 8 && out.size() < count; ++i) {
      out.push_back(static_cast<std::uint8_t>(word >> (8 * i)));
    }
  }
  return out;
}

Bytes Pseudonyms::opaque(ByteView value) const {
  return different(value, [&](std::uint8_t attempt) {
    return stream(Domain::opaque, value, attempt, value.size());
  });
}

Bytes Pseudonyms::imsi(ByteView value) const {
  const auto layout = imsiLayout(value);
  if (!layout) return opaque(value);
  Bytes digits;
  for (std::size_t i = 0; i < layout->digits; ++i) digits.push_back(layout->digitAt(value, i));
  return different(value, [&](std::uint8_t attempt) {
    const Bytes random = stream(Domain::imsi, digits, attempt, layout->digits);
    Bytes out(value.begin(), value.end());
    for (std::size_t i = layout->networkDigits; i < layout->digits; ++i) {
      layout->setDigit(out, i, static_cast<std::uint8_t>(random[i] % 10));
    }
    return out;
  });
}

std::uint32_t Pseudonyms::temporaryIdentity(std::uint32_t value) const {
  constexpr std::uint32_t kNone = 0xFFFFFFFF;
  constexpr std::uint32_t kKindBits = 0xC0000000;
  if (value == kNone) return value;
  const auto original = bytesOf(value);
  const auto pseudonym = [&](std::uint8_t attempt) {
    const Bytes random = stream(Domain::temporaryIdentity, original, attempt, original.size());
    return (value & kKindBits) | (numberOf(random) & ~kKindBits);
  };
  return numberOf(different(original, [&](std::uint8_t attempt) {
    const std::uint32_t candidate = pseudonym(attempt);
    return bytesOf(candidate == kNone ? candidate - 1 : candidate);
  }));
}

Bytes Pseudonyms::prefixedAddress(ByteView value, std::uint8_t prefix) const {
  return different(value, [&](std::uint8_t attempt) {
    Bytes out = stream(Domain::address, value, attempt, value.size());
    out[0] = prefix;
    return out;
  });
}

Bytes Pseudonyms::addressPart(ByteView value) const {
  switch (value.size()) {
    case kIPv4Bytes:
      return prefixedAddress(value, kPrivateIPv4);
    case kIPv6Bytes:
      return prefixedAddress(value, kPrivateIPv6);
    default:
      return opaque(value);
  }
}

Bytes Pseudonyms::address(ByteView value) const {
  Bytes out;
  for (const std::size_t size : partsOf(value.size())) {
    const ByteView part = value.subspan(out.size(), size);
    const Bytes hidden = isNone(part) ? Bytes(part.begin(), part.end()) : addressPart(part);
    out.insert(out.end(), hidden.begin(), hidden.end());
  }
  return out;
}

}  // namespace qel
