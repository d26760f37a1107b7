#include <array>
#include <string_view>

#include "radio/BandNames.h"
#include "radio/Bands.h"
#include "radio/Frequencies.h"

namespace qel {
namespace {

// Downlink channels of a band, `step` apart; 0.2 MHz from number to number.
struct UmtsChannels {
  std::uint32_t band;
  std::uint32_t first;
  std::uint32_t last;
  std::int32_t offset;  // of the frequencies, in tenths of a MHz
  std::int32_t duplex;  // of the downlink over the uplink, in tenths of a MHz
  std::uint32_t step = 1;

  constexpr bool contain(std::uint32_t channel) const {
    return channel >= first && channel <= last && (channel - first) % step == 0;
  }
  constexpr Frequencies frequencies(std::uint32_t channel) const {
    const std::int32_t down = static_cast<std::int32_t>(2 * channel) + offset;
    return {.down = Frequency{down}, .up = Frequency{down - duplex}};
  }
};

// 25.101, clauses 5.3.1 and 5.4: of each band the run of channels; then, of bands II, IV to VII and
// XIX, those between the steps of the raster. Those of X, XII, XIII, XIV, XXV and XXVI are in no
// band here.
constexpr std::array kChannels = {
    UmtsChannels{1, 10562, 10838, 0, 1900},    UmtsChannels{2, 9662, 9938, 0, 800},
    UmtsChannels{2, 412, 687, 18501, 800, 25}, UmtsChannels{3, 1162, 1513, 15750, 950},
    UmtsChannels{4, 1537, 1738, 18050, 4000},  UmtsChannels{4, 1887, 2087, 17351, 4000, 25},
    UmtsChannels{5, 4357, 4458, 0, 450},       UmtsChannels{5, 1007, 1012, 6701, 450, 5},
    UmtsChannels{5, 1032, 1037, 6701, 450, 5}, UmtsChannels{5, 1062, 1087, 6701, 450, 25},
    UmtsChannels{6, 4387, 4413, 0, 450},       UmtsChannels{6, 1037, 1062, 6701, 450, 25},
    UmtsChannels{7, 2237, 2563, 21750, 1200},  UmtsChannels{7, 2587, 2912, 21051, 1200, 25},
    UmtsChannels{8, 2937, 3088, 3400, 450},    UmtsChannels{9, 9237, 9387, 0, 950},
    UmtsChannels{10, 3112, 3388, 14900, 4000}, UmtsChannels{11, 3712, 3787, 7360, 480},
    UmtsChannels{12, 3842, 3903, -370, 300},   UmtsChannels{13, 4017, 4043, -550, -310},
    UmtsChannels{14, 4117, 4143, -630, -300},  UmtsChannels{19, 712, 763, 7350, 450},
    UmtsChannels{19, 787, 837, 7201, 450, 25}, UmtsChannels{20, 4512, 4638, -1090, -410},
    UmtsChannels{21, 862, 912, 13260, 480},    UmtsChannels{22, 4662, 5038, 25800, 1000},
    UmtsChannels{25, 5112, 5413, 9100, 800},   UmtsChannels{26, 5762, 5913, -2910, 450},
};

constexpr std::array<std::string_view, 27> kNumerals = {
    "",    "I", "II", "III", "IV", "V",   "VI", "VII", "VIII", "IX", "X", "XI",  "XII", "XIII",
    "XIV", "",  "",   "",    "",   "XIX", "XX", "XXI", "XXII", "",   "",  "XXV", "XXVI"};

// Those of the only band that has the channel.
const UmtsChannels* onlyBandWith(std::uint32_t uarfcn) {
  const UmtsChannels* found = nullptr;
  for (const UmtsChannels& channels : kChannels) {
    if (!channels.contain(uarfcn)) continue;
    if (found) return nullptr;
    found = &channels;
  }
  return found;
}

std::optional<std::int32_t> systemBandOf(std::uint32_t band) {
  constexpr std::uint32_t kLastInARow = 9;
  if (band <= kLastInARow) return kUmtsI + static_cast<std::int32_t>(band) - 1;
  if (band == 11) return kUmtsXI;
  if (band == 19) return kUmtsXIX;
  return std::nullopt;
}

}  // namespace

std::optional<std::int32_t> umtsBandOf(std::uint32_t uarfcn) {
  const UmtsChannels* channels = onlyBandWith(uarfcn);
  return channels ? systemBandOf(channels->band) : std::nullopt;
}

std::string_view umtsNumeralOf(std::uint32_t uarfcn) {
  const UmtsChannels* channels = onlyBandWith(uarfcn);
  return channels ? kNumerals[channels->band] : "";
}

// The bands that share a channel have it at one frequency.
Frequencies umtsFrequencies(std::uint32_t uarfcn) {
  for (const UmtsChannels& channels : kChannels) {
    if (channels.contain(uarfcn)) return channels.frequencies(uarfcn);
  }
  return {};
}

}  // namespace qel
