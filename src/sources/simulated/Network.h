// The cells along the road.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

#include "radio/Technology.h"

namespace qel::sources {

// The home network, of the range kept for tests (23.003; ITU-T E.212).
inline constexpr std::uint32_t kMcc = 1;
inline constexpr std::uint32_t kMnc = 1;
inline constexpr std::uint32_t kMncDigits = 2;

// A carrier frequency and its rules of reselection. Levels are RSRP, RSCP or RXLEV.
struct Layer {
  Technology technology;
  std::uint32_t channel;        // EARFCN or UARFCN; 0 for GSM, where every cell has its own ARFCN
  std::uint32_t band;           // number of the operating band; MHz for GSM
  std::uint32_t systemBand;     // as SystemBand of the messages
  std::uint32_t bandwidthCode;  // LTE: 0 to 5 for 1.4 to 20 MHz
  double frequencyMhz;          // downlink
  double referenceDbm;     // reference signal at the antenna with its gain, less the car's loss
  double load;             // part of its resources that a cell uses on average
  std::uint32_t priority;  // 0, the lowest, to 7
  int minLevelDbm;         // least level to camp on
  int highThresholdDb;     // over that: reselect to this layer from one of lower priority
  int lowThresholdDb;      // over that: reselect to this layer from one of higher priority
  int servingLowDb;        // below that over the least level: leave for a lower priority
};

struct Cell {
  std::uint8_t layer;
  std::uint8_t sector;
  std::uint16_t site;
  std::uint32_t channel;
  std::uint32_t code;    // physical cell identity, primary scrambling code, or BSIC
  std::uint32_t cellId;  // 28 bits of LTE and UMTS, 16 bits of GSM
  std::uint32_t area;    // tracking or location area code
  std::uint32_t routingArea;
  double xM;
  double yM;
  double azimuthDeg;  // from the direction of the road, anticlockwise
};

std::span<const Layer> layers();
std::span<const Cell> cells();

inline const Layer& layerOf(const Cell& cell) { return layers()[cell.layer]; }

// In FDD the uplink's EARFCN lies that far above the downlink's (36.101, table 5.7.3-1: so for all
// bands of the drive).
inline constexpr std::uint32_t kUplinkEarfcnOffset = 18000;

}  // namespace qel::sources
