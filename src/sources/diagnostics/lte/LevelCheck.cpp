#include "sources/diagnostics/lte/LevelCheck.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "sources/diagnostics/layouts/LteSignalBlocks.h"

namespace qel::diagnostics {
namespace {

constexpr double kToleranceDb = 0.3;

constexpr std::array kCarrierBlocks = {6U, 15U, 25U, 50U, 75U, 100U};
constexpr std::array kMeasuredBlocks = {6U, 8U, 15U, 25U, 50U, 75U, 100U};

bool isAtFloor(const LteAntenna& antenna) { return antenna.rsrqDb <= kRsrq.addend; }

bool agrees(const LteAntenna& antenna, unsigned blocks) {
  const double rsrqDb = antenna.rsrpDbm - antenna.rssiDbm + 10 * std::log10(blocks);
  if (isAtFloor(antenna)) return rsrqDb <= antenna.rsrqDb + kToleranceDb;
  return std::abs(rsrqDb - antenna.rsrqDb) <= kToleranceDb;
}

template <class Check>
bool each(const LteAntennas& antennas, Check check) {
  return std::all_of(antennas.begin(), antennas.end(),
                     [&](const auto& antenna) { return !antenna || check(*antenna); });
}

std::size_t countOf(const LteAntennas& antennas) {
  return static_cast<std::size_t>(std::count_if(antennas.begin(), antennas.end(),
                                                [](const auto& antenna) { return !!antenna; }));
}

bool agree(const LteAntennas& antennas, std::span<const unsigned> choices) {
  return countOf(antennas) > 0 && std::any_of(choices.begin(), choices.end(), [&](unsigned blocks) {
           return each(antennas, [&](const LteAntenna& one) { return agrees(one, blocks); });
         });
}

}  // namespace

LteAntennas antennasOf(const Values& cell) {
  LteAntennas antennas;
  for (std::size_t i = 0; i < antennas.size(); ++i) {
    const auto rsrpDbm = cell.find(next(Field::rsrp0, i));
    if (!rsrpDbm || *rsrpDbm <= kRsrp.addend) continue;
    antennas[i] = LteAntenna{*rsrpDbm, cell[next(Field::rsrq0, i)], cell[next(Field::rssi0, i)],
                             cell.find(next(Field::snr0, i))};
  }
  return antennas;
}

bool serverAgrees(const LteAntennas& antennas) { return agree(antennas, kCarrierBlocks); }

bool neighbourAgrees(const LteAntennas& antennas) { return agree(antennas, kMeasuredBlocks); }

bool standsOut(const Values& cell, const LteAntennas& antennas) {
  if (countOf(antennas) < 2) return false;
  double best = kRsrp.addend;
  for (const auto& antenna : antennas) {
    if (antenna) best = std::max(best, antenna->rsrpDbm);
  }
  if (!cell.has(Field::rsrp) || cell[Field::rsrp] != best) return false;
  return each(antennas, [](const LteAntenna& one) {
    return isLikely(one.rsrpDbm, one.rsrqDb) && !isAtFloor(one) && one.rssiDbm <= -10;
  });
}

bool isCell(const LteCellName& name) { return name.pci <= kLastPci && name.earfcn <= kLastEarfcn; }

bool isLikely(double rsrpDbm, double rsrqDb) {
  return rsrpDbm >= -160 && rsrpDbm <= -20 && rsrqDb >= -30 && rsrqDb <= 5;
}

}  // namespace qel::diagnostics
