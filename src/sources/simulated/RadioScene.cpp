#include "sources/simulated/RadioScene.h"

#include <algorithm>
#include <cmath>
#include <numbers>

#include "base/SmallBlocks.h"
#include "sources/simulated/Journey.h"
#include "sources/simulated/Random.h"

namespace qel::sources {
namespace {

constexpr double kShadowDeviationDb = 5;
constexpr double kShadowStepM = 60;  // shadows are alike over that distance
constexpr double kFastDeviationDb = 1.6;
constexpr double kSecondAntennaDb = -1.5;
constexpr double kSmoothing = 0.3;  // weight of the newest measurement
constexpr double kOutOfReachM = 4500;
constexpr double kLowestDbm = -160;

// Thermal noise and the receiver's own, in what a level is measured over: a subcarrier of 15 kHz,
// or the WCDMA carrier of 3.84 MHz.
constexpr double kLteNoiseDbm = -125;
constexpr double kUmtsNoiseDbm = -100;
// A cell sends its pilot with a tenth of its greatest power.
constexpr double kUmtsTotalOverPilot = 10;
constexpr double kSubcarriersPerBlock = 12;
constexpr std::array kResourceBlocks = {6.0, 15.0, 25.0, 50.0, 75.0, 100.0};

struct Detection {
  double levelDbm;
  double qualityDb;
};

// By technology: what a receiver can make out at all.
constexpr std::array kDetection = {Detection{-128, -20}, Detection{-119, -20},
                                   Detection{-109, -99}};

double milliwatts(double dbm) { return std::pow(10.0, dbm / 10); }
double decibels(double ratio) { return 10 * std::log10(ratio); }

// Horizontal pattern of a sector antenna (36.942, clause 4.2.1): 65 degrees, 20 dB front to back.
double patternDb(double fromBoresightDeg) {
  const double angle = std::abs(std::remainder(fromBoresightDeg, 360.0));
  return -std::min(12 * (angle / 65) * (angle / 65), 20.0);
}

// Macro cell (36.942, clause 4.5), scaled to the frequency.
double pathLossDb(double distanceM, double frequencyMhz) {
  return 128.1 + 37.6 * std::log10(std::max(distanceM, 35.0) / 1000) +
         21 * std::log10(frequencyMhz / 2000);
}

}  // namespace

RadioScene::RadioScene(std::uint64_t seed) : _seed(seed), _signals(cells().size()) {}

double RadioScene::meanDbm(std::size_t index) const {
  const Cell& cell = cells()[index];
  const double dx = _carM - cell.xM;
  const double dy = -cell.yM;
  const double distanceM = std::sqrt(dx * dx + dy * dy);
  if (distanceM > kOutOfReachM) return kLowestDbm;
  const double directionDeg = std::atan2(dy, dx) * 180 / std::numbers::pi;
  const double place = _carM / kShadowStepM;
  const auto before = static_cast<std::uint64_t>(place);
  const double part = place - static_cast<double>(before);
  // A mast's shadow is the same for all that it carries.
  const double shadow = (1 - part) * normalOf(scramble(_seed, cell.site, before)) +
                        part * normalOf(scramble(_seed, cell.site, before + 1));
  const Layer& layer = layerOf(cell);
  return std::max(kLowestDbm, layer.referenceDbm + patternDb(directionDeg - cell.azimuthDeg) -
                                  pathLossDb(distanceM, layer.frequencyMhz) -
                                  ridgeLossDb(_carM, cell.xM) - underpassLossDb(_carM) +
                                  kShadowDeviationDb * shadow);
}

void RadioScene::receive(std::size_t index, std::uint64_t step) {
  const double mean = meanDbm(index);
  CellSignal& signal = _signals[index];
  for (std::size_t antenna = 0; antenna < kAntennas; ++antenna) {
    const double fast = normalOf(scramble(_seed + 1, index * kAntennas + antenna, step));
    signal.antennaDbm[antenna] =
        mean + kFastDeviationDb * fast + (antenna == 0 ? 0.0 : kSecondAntennaDb);
  }
}

// Quality of every cell at one antenna, from all that its carrier brings.
void RadioScene::weigh(std::size_t antenna) {
  std::vector<double, SmallBlockAllocator<double>> carrierMw(layers().size());
  for (std::size_t i = 0; i < carrierMw.size(); ++i) {
    const bool umts = layers()[i].technology == Technology::umts;
    carrierMw[i] = milliwatts(umts ? kUmtsNoiseDbm : kLteNoiseDbm);
  }
  for (std::size_t i = 0; i < _signals.size(); ++i) {
    const Layer& layer = layerOf(cells()[i]);
    const double sent = layer.technology == Technology::umts ? kUmtsTotalOverPilot : 1.0;
    carrierMw[cells()[i].layer] += milliwatts(_signals[i].antennaDbm[antenna]) * sent * layer.load;
  }
  for (std::size_t i = 0; i < _signals.size(); ++i) {
    const Layer& layer = layerOf(cells()[i]);
    const double totalMw = carrierMw[cells()[i].layer];
    const double ownMw = milliwatts(_signals[i].antennaDbm[antenna]);
    CellSignal& signal = _signals[i];
    if (layer.technology == Technology::gsm) {
      signal.antennaRssiDbm[antenna] = signal.antennaDbm[antenna];
      continue;
    }
    if (layer.technology == Technology::umts) {
      signal.antennaQualityDb[antenna] = decibels(ownMw / totalMw);
      signal.antennaSinrDb[antenna] = signal.antennaQualityDb[antenna] + 10;
      signal.antennaRssiDbm[antenna] = decibels(totalMw);
      continue;
    }
    const double othersMw = std::max(totalMw - ownMw * layer.load, milliwatts(kLteNoiseDbm));
    // While it is measured the cell itself is busy half of the time.
    const double measuredMw = othersMw + ownMw / 2;
    signal.antennaQualityDb[antenna] = decibels(ownMw / (kSubcarriersPerBlock * measuredMw));
    signal.antennaSinrDb[antenna] = decibels(ownMw / othersMw);
    signal.antennaRssiDbm[antenna] =
        decibels(measuredMw * kSubcarriersPerBlock * kResourceBlocks[layer.bandwidthCode]);
  }
}

void RadioScene::smooth(std::size_t index) {
  CellSignal& signal = _signals[index];
  const double weight = _first ? 1.0 : kSmoothing;
  const double level = (signal.antennaDbm[0] + signal.antennaDbm[1]) / 2;
  const double quality = (signal.antennaQualityDb[0] + signal.antennaQualityDb[1]) / 2;
  signal.levelDbm += weight * (level - signal.levelDbm);
  signal.qualityDb += weight * (quality - signal.qualityDb);
  const auto technology = static_cast<std::size_t>(layerOf(cells()[index]).technology);
  signal.detected = signal.levelDbm > kDetection[technology].levelDbm &&
                    signal.qualityDb > kDetection[technology].qualityDb;
}

void RadioScene::update(double carM, std::uint64_t step) {
  _carM = carM;
  for (std::size_t i = 0; i < _signals.size(); ++i) receive(i, step);
  for (std::size_t antenna = 0; antenna < kAntennas; ++antenna) weigh(antenna);
  for (std::size_t i = 0; i < _signals.size(); ++i) smooth(i);
  _first = false;
}

double RadioScene::marginDb(std::size_t cell) const {
  return _signals[cell].levelDbm - layerOf(cells()[cell]).minLevelDbm;
}

double RadioScene::sinrDb(std::size_t cell) const {
  return (_signals[cell].antennaSinrDb[0] + _signals[cell].antennaSinrDb[1]) / 2;
}

}  // namespace qel::sources
