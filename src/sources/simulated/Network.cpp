#include "sources/simulated/Network.h"

#include <array>
#include <vector>

#include "radio/Bands.h"

namespace qel::sources {
namespace {

using enum Technology;

// Priorities: LTE before UMTS before GSM. The capacity layer in band 7 only adds to the others.
constexpr std::array kLayers = {
    Layer{lte, 1300, 3, 122, 5, 1815, 24, 0.4, 6, -122, 14, 12, 8},
    Layer{lte, 6300, 20, 139, 3, 806, 24, 0.4, 5, -122, 14, 8, 6},
    Layer{lte, 2850, 7, 126, 5, 2630, 23, 0.3, 4, -120, 30, 30, 6},
    Layer{umts, 10713, 1, kUmtsI, 0, 2142.6, 42, 0.5, 3, -115, 10, 6, 5},
    Layer{umts, 3011, 8, kUmtsVIII, 0, 942.2, 40, 0.5, 3, -115, 10, 6, 5},
    Layer{gsm, 0, 900, kGsm900E, 0, 945, 51, 1.0, 1, -106, 10, 6, 0},
};

// Which layers a mast carries, as bits in the order above.
constexpr unsigned kWide = 0b000011;  // both LTE layers
constexpr unsigned kFull = 0b000111;  // and the capacity layer
constexpr unsigned kUmtsTown = 0b001000;
constexpr unsigned kUmtsCountry = 0b011000;
constexpr unsigned kGsm = 0b100000;

struct Mast {
  double xM;
  double yM;
  unsigned layers;
  std::uint32_t area;
};

constexpr std::array kMasts = {
    // First town; its two halves are tracking areas of their own.
    Mast{250, 90, kFull | kUmtsTown, 4097},
    Mast{1150, -80, kWide | kGsm, 4097},
    Mast{2050, 110, kFull | kUmtsTown, 4098},
    Mast{2700, -100, kWide, 4098},
    // Open country.
    Mast{3550, 120, kUmtsCountry, 4352},
    Mast{4000, -300, kGsm, 4352},
    Mast{4750, -110, kUmtsCountry, 4352},
    // Valley.
    Mast{5950, 160, kGsm, 4353},
    Mast{6900, -140, kGsm, 4353},
    // Second town.
    Mast{7750, -90, kFull | kUmtsTown, 4099},
    Mast{8450, 100, kWide | kGsm, 4099},
    Mast{9100, -110, kFull | kUmtsTown, 4099},
    Mast{9750, 80, kWide, 4099},
};

constexpr std::array kAzimuthsDeg = {30.0, 150.0, 270.0};

// A broadcast carrier for each GSM sector, none used twice within reach (E-GSM 900: 0 to 124).
constexpr std::array<std::uint32_t, 15> kArfcns = {12, 37, 61, 20,  45, 69, 28, 53,
                                                   77, 85, 93, 101, 8,  33, 57};

// Base station colours change with the mast so that neighbours differ; the network's is 2.
constexpr std::uint32_t bsicOf(std::uint32_t gsmSector) { return 2 * 8 + gsmSector % 8; }

Cell cellAt(const Mast& mast, std::size_t site, std::size_t layer, std::size_t sector) {
  const auto number = static_cast<std::uint32_t>(site * kAzimuthsDeg.size() + sector);
  Cell cell{};
  cell.layer = static_cast<std::uint8_t>(layer);
  cell.sector = static_cast<std::uint8_t>(sector);
  cell.site = static_cast<std::uint16_t>(site);
  cell.channel = kLayers[layer].channel;
  cell.area = mast.area;
  cell.routingArea = mast.area % 16 + 1;
  cell.xM = mast.xM;
  cell.yM = mast.yM;
  cell.azimuthDeg = kAzimuthsDeg[sector];
  const auto station = static_cast<std::uint32_t>(0x1230 + site);
  switch (kLayers[layer].technology) {
    case lte:
      // Modulo 3 the identities of one mast differ, as planning wants it.
      cell.code = 30 + number + 90 * static_cast<std::uint32_t>(layer);
      cell.cellId = station << 8 | static_cast<std::uint32_t>(layer * 4 + sector + 1);
      break;
    case umts:
      cell.code = (8 * number + 16 * static_cast<std::uint32_t>(layer)) % 512;
      cell.cellId = 0x0071 << 16 | (number * 10 + static_cast<std::uint32_t>(layer));
      break;
    case gsm:
      cell.cellId = 20000 + number;
      break;
  }
  return cell;
}

std::vector<Cell> allCells() {
  std::vector<Cell> all;
  std::uint32_t gsmSector = 0;
  for (std::size_t site = 0; site < kMasts.size(); ++site) {
    for (std::size_t layer = 0; layer < kLayers.size(); ++layer) {
      if ((kMasts[site].layers >> layer & 1) == 0) continue;
      for (std::size_t sector = 0; sector < kAzimuthsDeg.size(); ++sector) {
        all.push_back(cellAt(kMasts[site], site, layer, sector));
        if (kLayers[layer].technology != gsm) continue;
        all.back().channel = kArfcns.at(gsmSector);
        all.back().code = bsicOf(gsmSector);
        ++gsmSector;
      }
    }
  }
  return all;
}

}  // namespace

std::span<const Layer> layers() { return kLayers; }

std::span<const Cell> cells() {
  // A phone may still drive past them while the process ends.
  static const auto& all = *new std::vector<Cell>(allCells());
  return all;
}

}  // namespace qel::sources
