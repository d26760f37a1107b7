// Networks and areas as the air interface carries them.
#pragma once

#include <array>
#include <cstdint>
#include <optional>

#include "base/Bytes.h"

namespace qel::diagnostics {

// Country and network code in three bytes (24.008, clause 10.5.1.3).
using PlmnCode = std::array<std::uint8_t, 3>;

struct Network {
  std::uint32_t mcc = 0;
  std::uint32_t mnc = 0;
  std::uint32_t mncDigits = 0;  // 2 or 3

  friend bool operator==(const Network&, const Network&) = default;
};

struct LocationArea {
  PlmnCode plmn{};
  std::uint32_t lac = 0;  // 16 bits

  friend bool operator==(const LocationArea&, const LocationArea&) = default;
};

struct RoutingArea {
  LocationArea location;
  std::uint32_t rac = 0;  // 8 bits

  friend bool operator==(const RoutingArea&, const RoutingArea&) = default;
};

inline constexpr std::size_t kPlmnBytes = 3;
inline constexpr std::size_t kLocationAreaBytes = 5;
inline constexpr std::size_t kRoutingAreaBytes = 6;

// The caller has seen that the bytes are there; area codes have their high byte first.
PlmnCode plmnAt(ByteView bytes, std::size_t offset);
LocationArea locationAreaAt(ByteView bytes, std::size_t offset);
RoutingArea routingAreaAt(ByteView bytes, std::size_t offset);

// Nothing when a digit is none.
std::optional<Network> networkOf(const PlmnCode& plmn);
PlmnCode plmnOf(const Network& network);

// As a field of a message.
inline Bytes bytesOf(const PlmnCode& plmn) { return {plmn.begin(), plmn.end()}; }

}  // namespace qel::diagnostics
