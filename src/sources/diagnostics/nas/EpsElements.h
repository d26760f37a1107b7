// Elements of LTE's messages of the non-access stratum (24.301, clauses 9.9.2 to 9.9.4): from an
// element's value what it means; nothing where it is damaged.
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/EmmPart.h"

namespace qel::diagnostics {

inline constexpr std::size_t kMostTrackingAreas = 16;
inline constexpr std::size_t kMostEquivalentNetworks = 15;
inline constexpr std::size_t kMostAccessPointOctets = 100;

// Clause 9.9.3.33: one or more partial lists.
std::optional<std::vector<TrackingArea>> trackingAreas(ByteView value);

// Clause 9.9.3.12. What identifies the phone otherwise is not read: nothing.
std::optional<TemporaryIdentity> temporaryIdentity(ByteView value);

// 24.008, clause 10.5.1.13.
std::optional<std::vector<PlmnCode>> networkList(ByteView value);

// 23.003, clause 9.1: labels, here with dots between them.
std::optional<std::string> accessPointName(ByteView value);

struct PdnAddress {       // clause 9.9.4.9
  std::int32_t type = 0;  // PdpType
  Bytes address;          // of IPv6 the interface identifier alone, with IPv4's behind it
};
std::optional<PdnAddress> pdnAddress(ByteView value);

// The name servers of protocol configuration options, the first two (24.008, clause 10.5.6.3).
std::optional<std::vector<Bytes>> nameServers(ByteView options);

}  // namespace qel::diagnostics
