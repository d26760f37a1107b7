#include <algorithm>
#include <array>

#include "radio/Bands.h"
#include "radio/Frequencies.h"

namespace qel {
namespace {

// How a band is laid out. Frequencies in tenths of a MHz, at the first channel.
struct LteBand {
  std::uint32_t band;
  std::uint32_t first;
  std::uint32_t last;
  std::int32_t down;
  // The uplink; all three 0: there is none. A band in time division has one for both ways.
  std::uint32_t upFirst = 0;
  std::uint32_t upLast = 0;
  std::int32_t up = 0;

  constexpr bool hasDown(std::uint32_t channel) const {
    return first <= channel && channel <= last;
  }
  constexpr bool hasUp(std::uint32_t channel) const {
    return up != 0 && upFirst <= channel && channel <= upLast;
  }
  constexpr std::int32_t downAt(std::uint32_t channel) const {
    return down + static_cast<std::int32_t>(channel - first);
  }
  constexpr std::int32_t upAt(std::uint32_t channel) const {
    return up + static_cast<std::int32_t>(channel - upFirst);
  }
};

constexpr LteBand timeDivision(std::uint32_t band, std::uint32_t first, std::uint32_t last,
                               std::int32_t frequency) {
  return {band, first, last, frequency, first, last, frequency};
}

// 36.101, table 5.7.3-1.
constexpr std::array kBands = {
    LteBand{1, 0, 599, 21100, 18000, 18599, 19200},
    LteBand{2, 600, 1199, 19300, 18600, 19199, 18500},
    LteBand{3, 1200, 1949, 18050, 19200, 19949, 17100},
    LteBand{4, 1950, 2399, 21100, 19950, 20399, 17100},
    LteBand{5, 2400, 2649, 8690, 20400, 20649, 8240},
    LteBand{6, 2650, 2749, 8750, 20650, 20749, 8300},
    LteBand{7, 2750, 3449, 26200, 20750, 21449, 25000},
    LteBand{8, 3450, 3799, 9250, 21450, 21799, 8800},
    LteBand{9, 3800, 4149, 18449, 21800, 22149, 17499},
    LteBand{10, 4150, 4749, 21100, 22150, 22749, 17100},
    LteBand{11, 4750, 4949, 14759, 22750, 22949, 14279},
    LteBand{12, 5010, 5179, 7290, 23010, 23179, 6990},
    LteBand{13, 5180, 5279, 7460, 23180, 23279, 7770},
    LteBand{14, 5280, 5379, 7580, 23280, 23379, 7880},
    LteBand{17, 5730, 5849, 7340, 23730, 23849, 7040},
    LteBand{18, 5850, 5999, 8600, 23850, 23999, 8150},
    LteBand{19, 6000, 6149, 8750, 24000, 24149, 8300},
    LteBand{20, 6150, 6449, 7910, 24150, 24449, 8320},
    LteBand{21, 6450, 6599, 14959, 24450, 24599, 14479},
    LteBand{22, 6600, 7399, 35100, 24600, 25399, 34100},
    LteBand{23, 7500, 7699, 21800, 25500, 25699, 20000},
    LteBand{24, 7700, 8039, 15250, 25700, 26039, 16265},
    LteBand{25, 8040, 8689, 19300, 26040, 26689, 18500},
    LteBand{26, 8690, 9039, 8590, 26690, 27039, 8140},
    LteBand{27, 9040, 9209, 8520, 27040, 27209, 8070},
    LteBand{28, 9210, 9659, 7580, 27210, 27659, 7030},
    LteBand{29, 9660, 9769, 7170},
    LteBand{30, 9770, 9869, 23500, 27660, 27759, 23050},
    LteBand{31, 9870, 9919, 4625, 27760, 27809, 4525},
    LteBand{32, 9920, 10359, 14520},
    timeDivision(33, 36000, 36199, 19000),
    timeDivision(34, 36200, 36349, 20100),
    timeDivision(35, 36350, 36949, 18500),
    timeDivision(36, 36950, 37549, 19300),
    timeDivision(37, 37550, 37749, 19100),
    timeDivision(38, 37750, 38249, 25700),
    timeDivision(39, 38250, 38649, 18800),
    timeDivision(40, 38650, 39649, 23000),
    timeDivision(41, 39650, 41589, 24960),
    timeDivision(42, 41590, 43589, 34000),
    timeDivision(43, 43590, 45589, 36000),
    timeDivision(44, 45590, 46589, 7030),
    timeDivision(45, 46590, 46789, 14470),
    timeDivision(46, 46790, 54539, 51500),
    timeDivision(47, 54540, 55239, 58550),
    timeDivision(48, 55240, 56739, 35500),
    timeDivision(49, 56740, 58239, 35500),
    timeDivision(50, 58240, 59089, 14320),
    timeDivision(51, 59090, 59139, 14270),
    timeDivision(52, 59140, 60139, 33000),
    timeDivision(53, 60140, 60254, 24835),
    timeDivision(54, 60255, 60304, 16700),
    LteBand{65, 65536, 66435, 21100, 131072, 131971, 19200},
    LteBand{66, 66436, 67335, 21100, 131972, 132671, 17100},
    LteBand{67, 67336, 67535, 7380},
    LteBand{68, 67536, 67835, 7530, 132672, 132971, 6980},
    LteBand{69, 67836, 68335, 25700},
    LteBand{70, 68336, 68585, 19950, 132972, 133121, 16950},
    LteBand{71, 68586, 68935, 6170, 133122, 133471, 6630},
    LteBand{72, 68936, 68985, 4610, 133472, 133521, 4510},
    LteBand{73, 68986, 69035, 4600, 133522, 133571, 4500},
    LteBand{74, 69036, 69465, 14750, 133572, 134001, 14270},
    LteBand{75, 69466, 70315, 14320},
    LteBand{76, 70316, 70365, 14270},
    LteBand{85, 70366, 70545, 7280, 134002, 134181, 6980},
    LteBand{87, 70546, 70595, 4200, 134182, 134231, 4100},
    LteBand{88, 70596, 70645, 4220, 134232, 134281, 4120},
    LteBand{103, 70646, 70655, 7570, 134282, 134291, 7870},
    LteBand{106, 70656, 70705, 9350, 134292, 134341, 8960},
};

// From the lower edge of the first channel to the upper one of the last.
std::string spanText(std::int32_t first, std::uint32_t channels) {
  const Frequency end{first + static_cast<std::int32_t>(channels)};
  const std::string begin = Frequency{first}.text();
  return begin.substr(0, begin.find(' ')) + " to " + end.text();
}

const LteBand* withDown(std::uint32_t channel) {
  for (const LteBand& band : kBands) {
    if (band.hasDown(channel)) return &band;
  }
  return nullptr;
}

const LteBand* withUp(std::uint32_t channel) {
  for (const LteBand& band : kBands) {
    if (band.hasUp(channel)) return &band;
  }
  return nullptr;
}

}  // namespace

std::optional<std::uint32_t> lteBandOf(std::uint32_t earfcn) {
  const LteBand* band = withDown(earfcn);
  if (!band) return std::nullopt;
  return band->band;
}

Frequencies lteFrequencies(std::uint32_t earfcn) {
  const LteBand* band = withDown(earfcn);
  if (!band) return {};
  const std::uint32_t paired = earfcn - band->first + band->upFirst;
  return {.down = Frequency{band->downAt(earfcn)},
          .up = band->hasUp(paired) ? std::optional(Frequency{band->upAt(paired)}) : std::nullopt};
}

std::string lteBandSpan(std::uint32_t band) {
  const auto found = std::ranges::find(kBands, band, &LteBand::band);
  if (found == kBands.end()) return {};
  const std::string down = spanText(found->down, found->last - found->first + 1);
  if (found->up == 0) return down + " down";
  if (found->up == found->down) return down;
  return down + " down, " + spanText(found->up, found->upLast - found->upFirst + 1) + " up";
}

std::optional<Frequency> lteUplinkFrequency(std::uint32_t earfcn) {
  const LteBand* band = withUp(earfcn);
  if (!band) return std::nullopt;
  return Frequency{band->upAt(earfcn)};
}

}  // namespace qel
