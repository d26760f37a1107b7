// The quantities whose curves are kept.
#pragma once

#include <array>
#include <cstdint>
#include <string_view>

#include "radio/Technology.h"

namespace qel {

// Of the serving cell.
enum class Quantity : std::uint8_t { lteRsrp, lteRsrq, lteSinr, umtsRscp, umtsEcno, gsmRxlev };

inline constexpr std::array kQuantities = {Quantity::lteRsrp,  Quantity::lteRsrq,
                                           Quantity::lteSinr,  Quantity::umtsRscp,
                                           Quantity::umtsEcno, Quantity::gsmRxlev};

// What a quantity is to a reader.
struct QuantityFacts {
  Technology technology;
  std::string_view name;  // "RSRP"
  std::string_view unit;  // "dBm" or "dB"
  float good;             // from here up it is good,
  float fair;             // from here up fair, and else poor
  float lowest;           // ends of an axis that shows every usual value
  float highest;
};

const QuantityFacts& factsOf(Quantity quantity);

// The level and the quality of a technology, and LTE's ratio of signal to noise.
constexpr Quantity levelOf(Technology technology) {
  switch (technology) {
    case Technology::lte:
      return Quantity::lteRsrp;
    case Technology::umts:
      return Quantity::umtsRscp;
    case Technology::gsm:
      return Quantity::gsmRxlev;
  }
  return Quantity::lteRsrp;
}

}  // namespace qel
