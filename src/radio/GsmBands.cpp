#include <algorithm>
#include <array>
#include <string_view>

#include "radio/BandNames.h"
#include "radio/Bands.h"
#include "radio/Frequencies.h"

namespace qel {
namespace {

// Channels of a band, 0.2 MHz apart.
struct GsmChannels {
  std::int32_t band;
  std::string_view name;
  std::uint32_t first;
  std::uint32_t last;
  std::int32_t down;    // of the first, in tenths of a MHz
  std::int32_t duplex;  // of the downlink over the uplink, in tenths of a MHz

  constexpr bool contain(std::uint32_t arfcn) const { return first <= arfcn && arfcn <= last; }
  constexpr Frequencies frequencies(std::uint32_t arfcn) const {
    const std::int32_t here = down + static_cast<std::int32_t>(2 * (arfcn - first));
    return {.down = Frequency{here}, .up = Frequency{here - duplex}};
  }
};

// 45.005, clause 2.
constexpr std::array kChannels = {
    GsmChannels{kGsm900E, "GSM 900", 0, 0, 9350, 450},
    GsmChannels{kGsm900P, "GSM 900", 1, 124, 9352, 450},
    GsmChannels{kGsm850, "GSM 850", 128, 251, 8692, 450},
    GsmChannels{kGsm450, "GSM 450", 259, 293, 4606, 100},
    GsmChannels{kGsm480, "GSM 480", 306, 340, 4890, 100},
    GsmChannels{kGsm750, "GSM 750", 438, 511, 7472, -300},
    GsmChannels{kGsmDcs1800, "DCS 1800", 512, 885, 18052, 950},
    GsmChannels{kGsmPcs1900, "PCS 1900", 512, 810, 19302, 800},
    GsmChannels{kGsm900R, "GSM 900", 955, 974, 9212, 450},
    GsmChannels{kGsm900E, "GSM 900", 975, 1023, 9252, 450},
};

// The channels of the only band that has the number, or of the given one where two have it.
const GsmChannels* channelsWith(std::uint32_t arfcn, std::optional<std::int32_t> band) {
  const GsmChannels* found = nullptr;
  const GsmChannels* given = nullptr;
  bool several = false;
  for (const GsmChannels& channels : kChannels) {
    if (!channels.contain(arfcn)) continue;
    several = found != nullptr;
    found = &channels;
    if (band == channels.band) given = &channels;
  }
  return several ? given : found;
}

// By country code (ITU-T E.212): the United States with their islands in the Pacific, Canada and
// Mexico have no DCS 1800; Europe, Asia, Africa and the rest of Oceania have no PCS 1900. Elsewhere
// in the Americas there are both.
std::optional<std::int32_t> bandAt1800Or1900(std::uint32_t mcc) {
  constexpr std::array<std::uint32_t, 5> kPcsAlone = {302, 334, 534, 535, 544};
  constexpr std::uint32_t kFirstOfUnitedStates = 310;
  constexpr std::uint32_t kLastOfUnitedStates = 316;
  const bool unitedStates = mcc >= kFirstOfUnitedStates && mcc <= kLastOfUnitedStates;
  if (unitedStates || std::ranges::count(kPcsAlone, mcc) != 0) return kGsmPcs1900;
  const std::uint32_t region = mcc / 100;
  const bool dcsAlone = region == 2 || region == 4 || region == 5 || region == 6;
  return dcsAlone ? std::optional<std::int32_t>(kGsmDcs1800) : std::nullopt;
}

}  // namespace

std::optional<std::int32_t> gsmBandOf(std::uint32_t arfcn, std::optional<std::uint32_t> mcc) {
  const auto ofCountry = mcc ? bandAt1800Or1900(*mcc) : std::nullopt;
  const GsmChannels* channels = channelsWith(arfcn, ofCountry);
  if (!channels) return std::nullopt;
  return channels->band;
}

std::string_view gsmBandName(std::int32_t systemBand) {
  const auto found = std::ranges::find(kChannels, systemBand, &GsmChannels::band);
  return found == kChannels.end() ? "" : found->name;
}

Frequencies gsmFrequencies(std::uint32_t arfcn, std::optional<std::int32_t> band) {
  const GsmChannels* channels = channelsWith(arfcn, band);
  return channels ? channels->frequencies(arfcn) : Frequencies{};
}

}  // namespace qel
