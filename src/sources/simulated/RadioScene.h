// What the phone receives of every cell at a moment.
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "sources/simulated/Network.h"

namespace qel::sources {

inline constexpr std::size_t kAntennas = 2;

// A cell's signal. LTE: RSRP, RSRQ and SINR; UMTS: RSCP and Ec/No; GSM: RXLEV alone.
struct CellSignal {
  bool detected = false;
  double levelDbm = -200;  // smoothed over about half a second, as decisions see it
  double qualityDb = -40;  // likewise
  std::array<double, kAntennas> antennaDbm{};
  std::array<double, kAntennas> antennaQualityDb{};
  std::array<double, kAntennas> antennaSinrDb{};
  std::array<double, kAntennas> antennaRssiDbm{};  // of the whole carrier
};

// Path loss, antenna patterns, ridges, shadow fading that is correlated along the road, fast fading
// and the interference of all cells of a carrier. A function of seed, place and time, but for the
// smoothing. One thread.
class RadioScene {
 public:
  explicit RadioScene(std::uint64_t seed);

  // The next moment, a step of the drive after the one before.
  void update(double carM, std::uint64_t step);

  double carM() const { return _carM; }
  const CellSignal& of(std::size_t cell) const { return _signals[cell]; }
  // Level over the least one that the cell's layer asks for.
  double marginDb(std::size_t cell) const;
  // The mean over the antennas.
  double sinrDb(std::size_t cell) const;
  std::size_t size() const { return _signals.size(); }

 private:
  double meanDbm(std::size_t cell) const;
  void receive(std::size_t cell, std::uint64_t step);
  void weigh(std::size_t antenna);
  void smooth(std::size_t cell);

  std::uint64_t _seed;
  double _carM = 0;
  bool _first = true;
  std::vector<CellSignal> _signals;
};

}  // namespace qel::sources
