// What is known of the modem on GSM.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "sources/diagnostics/packets/Plmn.h"
#include "sources/diagnostics/picture/GsmBroadcast.h"

namespace qel::diagnostics {

struct GsmCarrier {
  std::uint32_t arfcn = 0;
  std::optional<std::int32_t> band;  // a SystemBand

  friend bool operator==(const GsmCarrier&, const GsmCarrier&) = default;
};

struct GsmCell {
  LocationArea area;
  std::uint32_t cellId = 0;

  friend bool operator==(const GsmCell&, const GsmCell&) = default;
};

// The cell that the modem itself calls its own, with what the cell does not say of itself.
struct GsmCamp {
  GsmCell cell;
  GsmCarrier carrier;
  std::uint32_t bsic = 0;
};

struct GsmIdleLevel {
  double dbm = 0;
  std::optional<std::uint32_t> arfcn;
  std::uint64_t timeMs = 0;
};

// Of the measurement report to the network (44.018, clause 10.5.2.20).
struct GsmCallLevel {
  std::uint32_t rxlevSub = 0;   // dBm + 110
  std::uint32_t rxqualSub = 0;  // 0, the best, to 7
  std::uint64_t timeMs = 0;
};

struct GsmNeighbour {
  std::uint32_t arfcn = 0;
  std::optional<std::uint32_t> bsic;
  double levelDbm = 0;
  std::uint64_t timeMs = 0;
};

struct GsmPicture {
  static constexpr std::size_t kMostNeighbours = 64;

  std::optional<GsmCell> cell;
  std::optional<GsmCamp> camp;
  std::optional<bool> dedicated;
  GsmBroadcast broadcast;
  std::optional<GsmIdleLevel> idleLevel;
  std::optional<GsmCallLevel> callLevel;
  std::optional<std::vector<GsmNeighbour>> neighbours;  // nothing: never looked for

  // Of the serving cell; null while the modem has not told it.
  const GsmCamp* ownCamp() const {
    return camp && (!cell || *cell == camp->cell) ? &*camp : nullptr;
  }
};

}  // namespace qel::diagnostics
