// What is known of LTE's cells: the serving one, how it is received, its neighbours and carriers.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <vector>

namespace qel::diagnostics {

// In reports of the phone's, where it was not seen which channel they are about.
inline constexpr std::uint32_t kUnknownEarfcn = 0xFFFFFFFF;

// What tells a cell from others at one place.
struct LteCellName {
  std::uint32_t earfcn = 0;
  std::uint32_t pci = 0;

  friend bool operator==(const LteCellName&, const LteCellName&) = default;
};

// The serving cell as the modem describes it. Bandwidths are codes, 0 to 5.
struct LteServingCell {
  LteCellName name;
  std::uint32_t ulEarfcn = 0;
  std::optional<std::uint32_t> dlBandwidth;
  std::optional<std::uint32_t> ulBandwidth;
  std::uint32_t cellId = 0;  // 28 bits
  std::uint32_t area = 0;
  std::uint32_t band = 0;
  std::uint32_t mcc = 0;
  std::uint32_t mnc = 0;
  std::uint32_t mncDigits = 0;
};

// A cell's own broadcast of its bandwidth; not necessarily the serving cell's.
struct LteBroadcast {
  LteCellName name;
  std::optional<std::uint32_t> dlBandwidth;  // a code
};

// What one receive antenna makes of a cell.
struct LteAntenna {
  double rsrpDbm = 0;
  double rsrqDb = 0;
  double rssiDbm = 0;
  std::optional<double> snrDb;
};
using LteAntennas = std::array<std::optional<LteAntenna>, 4>;

struct LteSignal {
  LteCellName cell;
  LteAntennas antennas;
  std::uint64_t timeMs = 0;
};

// What all antennas together make of a cell.
struct LteLevel {
  double rsrpDbm = 0;
  double rsrqDb = 0;
  std::optional<double> rssiDbm;
  std::uint64_t timeMs = 0;
};

struct LteNeighbour {
  LteCellName cell;
  std::optional<double> rsrpDbm;
  std::optional<double> rsrqDb;
  std::uint64_t timeMs = 0;
};

// The latest of every cell, named by channel and number. At kMost the oldest makes room.
class LteNeighbours {
 public:
  static constexpr std::size_t kMost = 128;

  void note(const LteNeighbour& neighbour);
  // Those whose time `isOld` says to be too old.
  template <class IsOld>
  void forget(IsOld isOld) {
    std::erase_if(_cells, [&](const LteNeighbour& cell) { return isOld(cell.timeMs); });
  }

  const std::vector<LteNeighbour>& cells() const { return _cells; }

 private:
  std::vector<LteNeighbour> _cells;
};

// A carrier beside the primary one, as the network configured it.
struct SecondaryCarrier {
  std::uint32_t index = 0;  // of the secondary cell, from 1
  std::optional<std::uint32_t> pci;
  std::optional<std::uint32_t> earfcn;
  std::optional<std::uint32_t> band;
  std::optional<std::uint32_t> bandwidth;  // a code
  bool hasUplink = false;
  std::optional<std::uint32_t> ulEarfcn;
  std::optional<std::uint32_t> ulBand;
  std::optional<std::uint32_t> ulBandwidth;  // a code
  std::optional<bool> active;                // nothing: configured, and no more is known
  std::optional<LteSignal> signal;
};

// What the phone sent in one subframe.
struct LteTransmission {
  std::uint32_t subframe = 0;
  std::int32_t powerDbm = 0;
};

// Those of the latest packet.
struct LteTransmissions {
  std::vector<LteTransmission> list;
  std::uint64_t timeMs = 0;
};

}  // namespace qel::diagnostics
