#include "sources/Bands.h"

#include <algorithm>
#include <array>
#include <span>

namespace qel::sources {
namespace {

// Channels `first` to `last` in steps of `step`, all of one band.
struct Channels {
  std::uint32_t first;
  std::uint32_t last;
  std::uint32_t band;
  std::uint32_t step = 1;

  constexpr bool contain(std::uint32_t channel) const {
    return channel >= first && channel <= last && (channel - first) % step == 0;
  }
};

// 36.101, table 5.7.3-1.
constexpr std::array kLte = {
    Channels{0, 599, 1},        Channels{600, 1199, 2},      Channels{1200, 1949, 3},
    Channels{1950, 2399, 4},    Channels{2400, 2649, 5},     Channels{2650, 2749, 6},
    Channels{2750, 3449, 7},    Channels{3450, 3799, 8},     Channels{3800, 4149, 9},
    Channels{4150, 4749, 10},   Channels{4750, 4949, 11},    Channels{5010, 5179, 12},
    Channels{5180, 5279, 13},   Channels{5280, 5379, 14},    Channels{5730, 5849, 17},
    Channels{5850, 5999, 18},   Channels{6000, 6149, 19},    Channels{6150, 6449, 20},
    Channels{6450, 6599, 21},   Channels{6600, 7399, 22},    Channels{7500, 7699, 23},
    Channels{7700, 8039, 24},   Channels{8040, 8689, 25},    Channels{8690, 9039, 26},
    Channels{9040, 9209, 27},   Channels{9210, 9659, 28},    Channels{9660, 9769, 29},
    Channels{9770, 9869, 30},   Channels{9870, 9919, 31},    Channels{9920, 10359, 32},
    Channels{36000, 36199, 33}, Channels{36200, 36349, 34},  Channels{36350, 36949, 35},
    Channels{36950, 37549, 36}, Channels{37550, 37749, 37},  Channels{37750, 38249, 38},
    Channels{38250, 38649, 39}, Channels{38650, 39649, 40},  Channels{39650, 41589, 41},
    Channels{41590, 43589, 42}, Channels{43590, 45589, 43},  Channels{45590, 46589, 44},
    Channels{46590, 46789, 45}, Channels{46790, 54539, 46},  Channels{54540, 55239, 47},
    Channels{55240, 56739, 48}, Channels{56740, 58239, 49},  Channels{58240, 59089, 50},
    Channels{59090, 59139, 51}, Channels{59140, 60139, 52},  Channels{60140, 60254, 53},
    Channels{60255, 60304, 54}, Channels{65536, 66435, 65},  Channels{66436, 67335, 66},
    Channels{67336, 67535, 67}, Channels{67536, 67835, 68},  Channels{67836, 68335, 69},
    Channels{68336, 68585, 70}, Channels{68586, 68935, 71},  Channels{68936, 68985, 72},
    Channels{68986, 69035, 73}, Channels{69036, 69465, 74},  Channels{69466, 70315, 75},
    Channels{70316, 70365, 76}, Channels{70366, 70545, 85},  Channels{70546, 70595, 87},
    Channels{70596, 70645, 88}, Channels{70646, 70655, 103}, Channels{70656, 70705, 106},
};

// 25.101, table 5.2: of each band the run of channels, then those between the raster's steps.
constexpr std::array kUmts = {
    Channels{10562, 10838, kUmtsI},   Channels{9662, 9938, kUmtsII},
    Channels{412, 687, kUmtsII, 25},  Channels{1162, 1513, kUmtsIII},
    Channels{1537, 1738, kUmtsIV},    Channels{1887, 2087, kUmtsIV, 25},
    Channels{4357, 4458, kUmtsV},     Channels{1007, 1012, kUmtsV, 5},
    Channels{1032, 1037, kUmtsV, 5},  Channels{1062, 1087, kUmtsV, 25},
    Channels{4387, 4413, kUmtsVI},    Channels{1037, 1062, kUmtsVI, 25},
    Channels{2237, 2563, kUmtsVII},   Channels{2587, 2912, kUmtsVII, 25},
    Channels{2937, 3088, kUmtsVIII},  Channels{9237, 9387, kUmtsIX},
    Channels{3712, 3787, kUmtsXI},    Channels{712, 763, kUmtsXIX},
    Channels{787, 837, kUmtsXIX, 25},
};

// 45.005, clause 2.
constexpr std::array kGsm = {
    Channels{0, 0, kGsm900E},        Channels{1, 124, kGsm900P},      Channels{128, 251, kGsm850},
    Channels{259, 293, kGsm450},     Channels{306, 340, kGsm480},     Channels{438, 511, kGsm750},
    Channels{512, 885, kGsmDcs1800}, Channels{512, 810, kGsmPcs1900}, Channels{955, 974, kGsm900R},
    Channels{975, 1023, kGsm900E},
};

std::optional<std::uint32_t> onlyBandOf(std::uint32_t channel, std::span<const Channels> table) {
  std::optional<std::uint32_t> band;
  for (const Channels& row : table) {
    if (!row.contain(channel)) continue;
    if (band) return std::nullopt;
    band = row.band;
  }
  return band;
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

std::optional<std::int32_t> systemBand(std::optional<std::uint32_t> band) {
  if (!band) return std::nullopt;
  return static_cast<std::int32_t>(*band);
}

}  // namespace

std::optional<std::uint32_t> lteBandOf(std::uint32_t earfcn) { return onlyBandOf(earfcn, kLte); }

std::optional<std::int32_t> umtsBandOf(std::uint32_t uarfcn) {
  return systemBand(onlyBandOf(uarfcn, kUmts));
}

std::optional<std::int32_t> gsmBandOf(std::uint32_t arfcn, std::optional<std::uint32_t> mcc) {
  if (const auto band = onlyBandOf(arfcn, kGsm)) return systemBand(band);
  constexpr Channels kShared{512, 810, kGsmPcs1900};
  return mcc && kShared.contain(arfcn) ? bandAt1800Or1900(*mcc) : std::nullopt;
}

}  // namespace qel::sources
