#include "radio/Bands.h"

#include <gtest/gtest.h>

#include <vector>

namespace qel {
namespace {

struct Span {
  std::uint32_t first;
  std::uint32_t last;
  std::uint32_t band;
};

TEST(LteBands, BeginAndEndWhereTheStandardSaysAndAreContiguousOnlyThere) {
  const std::vector<Span> runs = {
      {0, 599, 1},         {600, 1199, 2},     {1200, 1949, 3},    {1950, 2399, 4},
      {2400, 2649, 5},     {2650, 2749, 6},    {2750, 3449, 7},    {3450, 3799, 8},
      {3800, 4149, 9},     {4150, 4749, 10},   {4750, 4949, 11},   {5010, 5179, 12},
      {5180, 5279, 13},    {5280, 5379, 14},   {5730, 5849, 17},   {5850, 5999, 18},
      {6000, 6149, 19},    {6150, 6449, 20},   {6450, 6599, 21},   {6600, 7399, 22},
      {7500, 7699, 23},    {7700, 8039, 24},   {8040, 8689, 25},   {8690, 9039, 26},
      {9040, 9209, 27},    {9210, 9659, 28},   {9660, 9769, 29},   {9770, 9869, 30},
      {9870, 9919, 31},    {9920, 10359, 32},  {36000, 36199, 33}, {36200, 36349, 34},
      {36350, 36949, 35},  {36950, 37549, 36}, {37550, 37749, 37}, {37750, 38249, 38},
      {38250, 38649, 39},  {38650, 39649, 40}, {39650, 41589, 41}, {41590, 43589, 42},
      {43590, 45589, 43},  {45590, 46589, 44}, {46590, 46789, 45}, {46790, 54539, 46},
      {54540, 55239, 47},  {55240, 56739, 48}, {56740, 58239, 49}, {58240, 59089, 50},
      {59090, 59139, 51},  {59140, 60139, 52}, {60140, 60254, 53}, {60255, 60304, 54},
      {65536, 66435, 65},  {66436, 67335, 66}, {67336, 67535, 67}, {67536, 67835, 68},
      {67836, 68335, 69},  {68336, 68585, 70}, {68586, 68935, 71}, {68936, 68985, 72},
      {68986, 69035, 73},  {69036, 69465, 74}, {69466, 70315, 75}, {70316, 70365, 76},
      {70366, 70545, 85},  {70546, 70595, 87}, {70596, 70645, 88}, {70646, 70655, 103},
      {70656, 70705, 106},
  };
  for (std::size_t i = 0; i < runs.size(); ++i) {
    const Span& run = runs[i];
    EXPECT_EQ(lteBandOf(run.first), run.band) << run.first;
    EXPECT_EQ(lteBandOf(run.last), run.band) << run.last;
    const bool last = i + 1 == runs.size();
    if (last || runs[i + 1].first != run.last + 1) {
      EXPECT_FALSE(lteBandOf(run.last + 1)) << run.last + 1;
    }
    if (i > 0 && runs[i - 1].last + 1 != run.first) {
      EXPECT_FALSE(lteBandOf(run.first - 1)) << run.first - 1;
    }
  }
  EXPECT_FALSE(lteBandOf(18000));  // an uplink channel
  EXPECT_FALSE(lteBandOf(0xFFFFFFFF));
}

TEST(UmtsBands, BeginAndEndWhereTheStandardSays) {
  const std::vector<Span> runs = {
      {10562, 10838, kUmtsI}, {9662, 9938, kUmtsII},  {1162, 1513, kUmtsIII},
      {1537, 1738, kUmtsIV},  {2237, 2563, kUmtsVII}, {2937, 3088, kUmtsVIII},
      {9237, 9387, kUmtsIX},  {3712, 3787, kUmtsXI},  {712, 763, kUmtsXIX},
  };
  for (const Span& run : runs) {
    EXPECT_EQ(umtsBandOf(run.first), static_cast<std::int32_t>(run.band)) << run.first;
    EXPECT_EQ(umtsBandOf(run.last), static_cast<std::int32_t>(run.band)) << run.last;
    EXPECT_FALSE(umtsBandOf(run.first - 1)) << run.first - 1;
    EXPECT_FALSE(umtsBandOf(run.last + 1)) << run.last + 1;
  }
}

TEST(UmtsBands, HaveChannelsBetweenTheStepsOfTheRaster) {
  const std::vector<std::pair<std::int32_t, std::vector<std::uint32_t>>> additional = {
      {kUmtsII, {412, 437, 462, 487, 512, 537, 562, 587, 612, 637, 662, 687}},
      {kUmtsIV, {1887, 1912, 1937, 1962, 1987, 2012, 2037, 2062, 2087}},
      {kUmtsV, {1007, 1012, 1032, 1087}},
      {kUmtsVII,
       {2587, 2612, 2637, 2662, 2687, 2712, 2737, 2762, 2787, 2812, 2837, 2862, 2887, 2912}},
      {kUmtsXIX, {787, 812, 837}},
  };
  for (const auto& [band, channels] : additional) {
    for (const std::uint32_t channel : channels) {
      EXPECT_EQ(umtsBandOf(channel), band) << channel;
      EXPECT_FALSE(umtsBandOf(channel + 1)) << channel + 1;
      EXPECT_FALSE(umtsBandOf(channel - 1)) << channel - 1;
    }
  }
}

TEST(UmtsBands, AreLeftOpenWhereTwoShareAChannel) {
  EXPECT_EQ(umtsBandOf(4357), kUmtsV);
  EXPECT_EQ(umtsBandOf(4386), kUmtsV);
  for (std::uint32_t channel = 4387; channel <= 4413; ++channel) EXPECT_FALSE(umtsBandOf(channel));
  EXPECT_EQ(umtsBandOf(4414), kUmtsV);
  EXPECT_EQ(umtsBandOf(4458), kUmtsV);
  EXPECT_FALSE(umtsBandOf(4356));
  EXPECT_FALSE(umtsBandOf(4459));
  EXPECT_FALSE(umtsBandOf(1037));
  EXPECT_FALSE(umtsBandOf(1062));
}

TEST(GsmBands, BeginAndEndWhereTheStandardSays) {
  const std::vector<Span> runs = {
      {0, 0, kGsm900E},        {1, 124, kGsm900P},   {128, 251, kGsm850},
      {259, 293, kGsm450},     {306, 340, kGsm480},  {438, 511, kGsm750},
      {811, 885, kGsmDcs1800}, {955, 974, kGsm900R}, {975, 1023, kGsm900E},
  };
  for (const Span& run : runs) {
    EXPECT_EQ(gsmBandOf(run.first), static_cast<std::int32_t>(run.band)) << run.first;
    EXPECT_EQ(gsmBandOf(run.last), static_cast<std::int32_t>(run.band)) << run.last;
  }
  for (const std::uint32_t outside :
       {125U, 127U, 252U, 258U, 294U, 305U, 341U, 437U, 886U, 954U, 1024U}) {
    EXPECT_FALSE(gsmBandOf(outside)) << outside;
  }
}

TEST(GsmBands, AreLeftOpenWhereANumberStandsForTwoCarriers) {
  for (std::uint32_t channel = 512; channel <= 810; ++channel) EXPECT_FALSE(gsmBandOf(channel));
}

TEST(GsmBands, AreSettledByTheCountryWhereThatHasOnlyOneOfTheTwo) {
  for (const std::uint32_t channel : {512U, 661U, 810U}) {
    for (const std::uint32_t mcc : {302U, 310U, 316U, 334U, 534U, 535U, 544U}) {
      EXPECT_EQ(gsmBandOf(channel, mcc), kGsmPcs1900) << mcc;
    }
    for (const std::uint32_t mcc : {202U, 262U, 454U, 505U, 530U, 655U}) {
      EXPECT_EQ(gsmBandOf(channel, mcc), kGsmDcs1800) << mcc;
    }
    for (const std::uint32_t mcc : {1U, 317U, 338U, 340U, 724U, 748U, 901U}) {
      EXPECT_FALSE(gsmBandOf(channel, mcc)) << mcc;
    }
  }
  EXPECT_EQ(gsmBandOf(811, 310), kGsmDcs1800);
  EXPECT_EQ(gsmBandOf(62, 310), kGsm900P);
  EXPECT_FALSE(gsmBandOf(300, 262));
}

}  // namespace
}  // namespace qel
