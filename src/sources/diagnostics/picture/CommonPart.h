// What the modem keeps about networks and areas, whatever the technology.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "sources/diagnostics/packets/Plmn.h"

namespace qel::diagnostics {

struct TrackingArea {
  PlmnCode plmn{};
  std::uint32_t tac = 0;  // 16 bits

  friend bool operator==(const TrackingArea&, const TrackingArea&) = default;
};

struct CommonPart {
  // Of each list; the oldest goes (24.008, clause 4.1.2.2: at least ten).
  static constexpr std::size_t kMostForbidden = 40;

  Bytes imsi;  // as EF_IMSI has it (31.102, clause 4.2.2); empty: not known
  std::optional<std::vector<PlmnCode>> equivalents;
  std::vector<LocationArea> noRoaming;  // forbidden for roaming
  std::vector<LocationArea> noService;  // forbidden for regional provision of service
  std::vector<TrackingArea> noRoamingTracking;
  std::vector<TrackingArea> noServiceTracking;
};

// Remembers an area that was refused, each once.
template <class Area>
void forbid(std::vector<Area>& areas, const Area& area) {
  std::erase(areas, area);
  if (areas.size() >= CommonPart::kMostForbidden) areas.erase(areas.begin());
  areas.push_back(area);
}

// Takes it off again: the network has accepted the phone there.
template <class Area>
void allow(std::vector<Area>& areas, const Area& area) {
  std::erase(areas, area);
}

}  // namespace qel::diagnostics
