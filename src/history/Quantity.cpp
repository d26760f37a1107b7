#include "history/Quantity.h"

namespace qel {
namespace {

// The limits of good and fair are usual ones of the field, not 3GPP's; the ends of an axis are
// about those of what phones report (36.133, 9.1; 25.133, 9.1; 45.008, 8.1.4).
constexpr std::array kFacts = {
    QuantityFacts{Technology::lte, "RSRP", "dBm", -95, -110, -140, -44},
    QuantityFacts{Technology::lte, "RSRQ", "dB", -10, -15, -20, -3},
    QuantityFacts{Technology::lte, "SINR", "dB", 13, 0, -20, 30},
    QuantityFacts{Technology::umts, "RSCP", "dBm", -85, -100, -121, -25},
    QuantityFacts{Technology::umts, "Ec/No", "dB", -8, -14, -24.5F, 0},
    QuantityFacts{Technology::gsm, "RxLev", "dBm", -75, -90, -110, -47},
};

}  // namespace

const QuantityFacts& factsOf(Quantity quantity) {
  return kFacts.at(static_cast<std::size_t>(quantity));
}

}  // namespace qel
