// Messages of 2G's and 3G's mobility and session management (24.008, clauses 9.2, 9.4 and 9.5), as
// far as they are of use here. Each reader takes a message from behind its type on and gives
// nothing when it is damaged; values are as they are signalled.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "sources/diagnostics/packets/Plmn.h"
#include "sources/diagnostics/picture/ConnectionsPart.h"

namespace qel::diagnostics {

// A temporary identity, or that the network has taken it away.
struct GivenIdentity {
  std::optional<std::uint32_t> tmsi;
};

struct LocationAccept {
  LocationArea area;
  std::optional<GivenIdentity> identity;
  std::vector<PlmnCode> equivalents;
  std::optional<std::uint32_t> t3212S;  // 0: switched off
};
std::optional<LocationAccept> readLocationAccept(ByteView body);

// Of a TMSI reallocation.
std::optional<LocationAccept> readNewTmsi(ByteView body);

// Of attaching, and of updating the routing area.
struct PacketAccept {
  bool combined = false;  // for both domains, as the network has granted it
  RoutingArea area;
  std::uint32_t t3312S = 0;  // 0: switched off
  std::optional<std::uint32_t> pTmsi;
  std::optional<GivenIdentity> identity;  // of the circuit-switched domain
  std::optional<std::uint8_t> cause;      // why not for that one
  std::vector<PlmnCode> equivalents;
};
std::optional<PacketAccept> readAttachAccept(ByteView body);
std::optional<PacketAccept> readUpdateAccept(ByteView body);

// The type of the procedure that the phone asks for, 3 bits.
std::optional<std::uint8_t> readAttachType(ByteView body);
std::optional<std::uint8_t> readUpdateType(ByteView body);

// The phone asks for a connection: of it the number, the name and the type are known.
std::optional<PacketConnection> readActivateRequest(ByteView body);

// The network grants it.
struct ActivateAccept {
  std::optional<std::int32_t> type;
  Bytes address;
  std::vector<Bytes> nameServers;
};
std::optional<ActivateAccept> readActivateAccept(ByteView body);

}  // namespace qel::diagnostics
