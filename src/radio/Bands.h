// The operating band of a carrier, where the carrier's number alone decides it.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "radio/Technology.h"

namespace qel {

// Of SystemBand, those that a channel can be found to lie in.
enum SystemBandCode : std::int32_t {
  kGsm450 = 40,
  kGsm480 = 41,
  kGsm750 = 42,
  kGsm850 = 43,
  kGsm900E = 44,
  kGsm900P = 45,
  kGsm900R = 46,
  kGsmDcs1800 = 47,
  kGsmPcs1900 = 48,
  kUmtsI = 80,
  kUmtsII = 81,
  kUmtsIII = 82,
  kUmtsIV = 83,
  kUmtsV = 84,
  kUmtsVI = 85,
  kUmtsVII = 86,
  kUmtsVIII = 87,
  kUmtsIX = 88,
  kUmtsXI = 90,
  kUmtsXIX = 91,
};

// By the downlink EARFCN: the band's number (36.101, clause 5.7.3).
std::optional<std::uint32_t> lteBandOf(std::uint32_t earfcn);

// By the downlink UARFCN: a SystemBand (25.101, clause 5.4.4). Nothing for a channel that two bands
// share (V and VI) and for bands that SystemBand does not name.
std::optional<std::int32_t> umtsBandOf(std::uint32_t uarfcn);

// By the ARFCN: a SystemBand, of the 900 MHz bands the narrowest one (45.005, clause 2). 512 to 810
// stand for carriers of DCS 1800 and of PCS 1900: there the country decides, where it has only one
// of the two, and else nothing does.
std::optional<std::int32_t> gsmBandOf(std::uint32_t arfcn, std::optional<std::uint32_t> mcc = {});

// In words, by the downlink channel: "band 20", "band VIII", "GSM 900", "DCS 1800". Empty where the
// channel does not decide it.
std::string bandText(Technology technology, std::uint32_t channel,
                     std::optional<std::uint32_t> mcc = {});

}  // namespace qel
