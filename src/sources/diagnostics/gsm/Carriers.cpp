#include "sources/diagnostics/gsm/Carriers.h"

#include <algorithm>
#include <array>

#include "radio/Bands.h"

namespace qel::diagnostics {
namespace {

struct Channels {
  std::uint32_t code;  // of the modem
  std::uint32_t first;
  std::uint32_t last;
  std::int32_t band;
};

constexpr std::array kChannels = {
    Channels{8, 0, 0, kGsm900E},        Channels{8, 1, 124, kGsm900P},
    Channels{8, 955, 974, kGsm900R},    Channels{8, 975, 1023, kGsm900E},
    Channels{9, 512, 885, kGsmDcs1800}, Channels{10, 512, 810, kGsmPcs1900},
    Channels{11, 128, 251, kGsm850},    Channels{12, 259, 293, kGsm450},
    Channels{12, 306, 340, kGsm480},
};

}  // namespace

GsmCarrier carrierOf(std::uint32_t word) {
  constexpr std::uint32_t kHighestArfcn = 1023;
  GsmCarrier carrier{word & kHighestArfcn, std::nullopt};
  const std::uint32_t code = word >> 12;
  const auto row = std::ranges::find_if(kChannels, [&](const Channels& channels) {
    return channels.code == code && carrier.arfcn >= channels.first &&
           carrier.arfcn <= channels.last;
  });
  if (row != kChannels.end()) carrier.band = row->band;
  return carrier;
}

}  // namespace qel::diagnostics
