// What is known of the modem on UMTS.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <vector>

#include "sources/diagnostics/packets/Plmn.h"
#include "sources/diagnostics/picture/UmtsBroadcast.h"
#include "sources/diagnostics/picture/UmtsSegments.h"

namespace qel::diagnostics {

// A reading and when it was taken.
struct UmtsLevel {
  double value = 0;  // dBm or dB
  std::uint64_t timeMs = 0;
};

struct UmtsCell {
  std::optional<Network> network;
  std::uint32_t areaCode = 0;
  std::uint32_t cellId = 0;
  std::uint32_t uarfcn = 0;  // downlink
  std::uint32_t scramblingCode = 0;

  bool sameAs(const UmtsCell& other) const {
    return cellId == other.cellId && uarfcn == other.uarfcn &&
           scramblingCode == other.scramblingCode;
  }
};

// Of the serving cell.
struct UmtsSignal {
  static constexpr std::size_t kReceivers = 2;

  std::optional<UmtsLevel> rscpDbm;
  std::optional<UmtsLevel> ecnoDb;
  std::array<std::optional<UmtsLevel>, kReceivers> rssiDbm;
};

struct UmtsNeighbour {
  std::uint32_t uarfcn = 0;
  std::uint32_t scramblingCode = 0;
  double rscpDbm = 0;
  double ecnoDb = 0;
};

struct UmtsGsmNeighbour {
  std::uint32_t arfcn = 0;
  std::optional<std::uint32_t> bsic;
  double levelDbm = 0;
};

struct UmtsNeighbours {
  std::uint64_t timeMs = 0;
  std::vector<UmtsNeighbour> umts;
  std::vector<UmtsGsmNeighbour> gsm;
};

// In the order of the metric's own enumeration.
enum class UmtsState : std::uint8_t {
  invalid,
  inactive,
  idle,
  establish,
  uraPch,
  cellPch,
  cellFach,
  cellDch,
  release,
};

struct UmtsConnection {
  std::optional<UmtsState> state;
  std::optional<std::uint32_t> establishmentCause;  // as the metric numbers them
  std::optional<std::uint32_t> releaseCause;

  std::optional<bool> connected() const {
    if (!state) return std::nullopt;
    return *state >= UmtsState::uraPch && *state <= UmtsState::release;
  }
};

struct UmtsPicture {
  std::optional<UmtsCell> cell;
  UmtsSignal signal;
  std::optional<UmtsLevel> transmitDbm;
  std::optional<UmtsNeighbours> neighbours;
  UmtsConnection connection;
  UmtsBroadcast broadcast;
  UmtsSegments segments;
};

}  // namespace qel::diagnostics
