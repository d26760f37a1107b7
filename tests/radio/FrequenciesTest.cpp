#include "radio/Frequencies.h"

#include <gtest/gtest.h>

#include "radio/Bands.h"

namespace qel {
namespace {

TEST(LteFrequencies, areThoseOfTheBandsTable) {
  struct Row {
    std::uint32_t channel;
    const char* text;
  };
  for (const Row& row : {
           Row{0, "2110.0 MHz down, 1920.0 MHz up"},
           Row{300, "2140.0 MHz down, 1950.0 MHz up"},
           Row{1575, "1842.5 MHz down, 1747.5 MHz up"},
           Row{2850, "2630.0 MHz down, 2510.0 MHz up"},
           Row{3800, "1844.9 MHz down, 1749.9 MHz up"},
           Row{5230, "751.0 MHz down, 782.0 MHz up"},
           Row{6300, "806.0 MHz down, 847.0 MHz up"},
           Row{38000, "2595.0 MHz down, 2595.0 MHz up"},
           Row{40620, "2593.0 MHz down, 2593.0 MHz up"},
           Row{68586, "617.0 MHz down, 663.0 MHz up"},
       }) {
    EXPECT_EQ(lteFrequencies(row.channel).text(), row.text) << row.channel;
  }
}

TEST(LteFrequencies, haveNoUplinkWhereTheBandHasNone) {
  EXPECT_EQ(lteFrequencies(9700).text(), "721.0 MHz down");
  EXPECT_FALSE(lteFrequencies(67000 + 250).up) << "the upper part of band 66 only receives";
  EXPECT_EQ(lteFrequencies(66436).text(), "2110.0 MHz down, 1710.0 MHz up");
}

TEST(LteFrequencies, areNoneOutsideOfTheBands) {
  for (const std::uint32_t channel : {4950U, 18000U, 60305U, 0xFFFFFFFFU}) {
    EXPECT_EQ(lteFrequencies(channel), Frequencies{}) << channel;
    EXPECT_EQ(lteFrequencies(channel).text(), "");
  }
}

TEST(LteFrequencies, ofAnUplinkChannelAreItsOwn) {
  EXPECT_EQ(lteUplinkFrequency(19575)->text(), "1747.5 MHz");
  EXPECT_EQ(lteUplinkFrequency(24300)->text(), "847.0 MHz");
  EXPECT_EQ(lteUplinkFrequency(38000)->text(), "2595.0 MHz");
  EXPECT_FALSE(lteUplinkFrequency(1575));
  EXPECT_FALSE(lteUplinkFrequency(0));
}

// Every channel of every band has the uplink that a phone would take: at the same place of its
// band.
TEST(LteFrequencies, ofTheTwoWaysLieOneDistanceApart) {
  for (std::uint32_t channel = 0; channel < 70706; ++channel) {
    const Frequencies both = lteFrequencies(channel);
    ASSERT_EQ(both.down.has_value(), lteBandOf(channel).has_value()) << channel;
    if (!both.up || channel == 0 || lteBandOf(channel) != lteBandOf(channel - 1)) continue;
    EXPECT_EQ(both.up->tenthsOfMhz - lteFrequencies(channel - 1).up->tenthsOfMhz, 1) << channel;
  }
}

TEST(LteBandSpans, reachFromEdgeToEdge) {
  EXPECT_EQ(lteBandSpan(3), "1805.0 to 1880.0 MHz down, 1710.0 to 1785.0 MHz up");
  EXPECT_EQ(lteBandSpan(20), "791.0 to 821.0 MHz down, 832.0 to 862.0 MHz up");
  EXPECT_EQ(lteBandSpan(66), "2110.0 to 2200.0 MHz down, 1710.0 to 1780.0 MHz up");
  EXPECT_EQ(lteBandSpan(29), "717.0 to 728.0 MHz down");
  EXPECT_EQ(lteBandSpan(38), "2570.0 to 2620.0 MHz");
  EXPECT_EQ(lteBandSpan(15), "");
  EXPECT_EQ(lteBandSpan(0), "");
}

TEST(UmtsFrequencies, areAFifthOfTheNumberOverTheOffset) {
  EXPECT_EQ(umtsFrequencies(10562).text(), "2112.4 MHz down, 1922.4 MHz up");
  EXPECT_EQ(umtsFrequencies(10838).text(), "2167.6 MHz down, 1977.6 MHz up");
  EXPECT_EQ(umtsFrequencies(3011).text(), "942.2 MHz down, 897.2 MHz up");
  EXPECT_EQ(umtsFrequencies(1537).text(), "2112.4 MHz down, 1712.4 MHz up");
  EXPECT_EQ(umtsFrequencies(4512).text(), "793.4 MHz down, 834.4 MHz up");
}

TEST(UmtsFrequencies, betweenTheStepsOfTheRasterHaveTheirOwnOffset) {
  EXPECT_EQ(umtsFrequencies(412).text(), "1932.5 MHz down, 1852.5 MHz up");
  EXPECT_EQ(umtsFrequencies(1887).text(), "2112.5 MHz down, 1712.5 MHz up");
  EXPECT_EQ(umtsFrequencies(1007).text(), "871.5 MHz down, 826.5 MHz up");
  EXPECT_EQ(umtsFrequencies(2587).text(), "2622.5 MHz down, 2502.5 MHz up");
  EXPECT_EQ(umtsFrequencies(787).text(), "877.5 MHz down, 832.5 MHz up");
}

TEST(UmtsFrequencies, areKnownWhereTwoBandsShareAChannel) {
  EXPECT_FALSE(umtsBandOf(4400));
  EXPECT_EQ(umtsFrequencies(4400).text(), "880.0 MHz down, 835.0 MHz up");
  EXPECT_EQ(umtsFrequencies(1037).text(), "877.5 MHz down, 832.5 MHz up");
  EXPECT_EQ(umtsFrequencies(5), Frequencies{});
}

TEST(GsmFrequencies, areAFifthOfTheNumberOverTheBandsFirst) {
  EXPECT_EQ(gsmFrequencies(0).text(), "935.0 MHz down, 890.0 MHz up");
  EXPECT_EQ(gsmFrequencies(62).text(), "947.4 MHz down, 902.4 MHz up");
  EXPECT_EQ(gsmFrequencies(128).text(), "869.2 MHz down, 824.2 MHz up");
  EXPECT_EQ(gsmFrequencies(885).text(), "1879.8 MHz down, 1784.8 MHz up");
  EXPECT_EQ(gsmFrequencies(955).text(), "921.2 MHz down, 876.2 MHz up");
  EXPECT_EQ(gsmFrequencies(1023).text(), "934.8 MHz down, 889.8 MHz up");
  EXPECT_EQ(gsmFrequencies(900), Frequencies{});
}

TEST(GsmFrequencies, areLeftOpenWhereANumberStandsForTwoCarriers) {
  EXPECT_EQ(gsmFrequencies(661), Frequencies{});
  EXPECT_EQ(gsmFrequencies(661, kGsmDcs1800).text(), "1835.0 MHz down, 1740.0 MHz up");
  EXPECT_EQ(gsmFrequencies(661, kGsmPcs1900).text(), "1960.0 MHz down, 1880.0 MHz up");
  EXPECT_EQ(gsmFrequencies(661, kGsm900E), Frequencies{});
}

TEST(FrequenciesOf, anyTechnologyAreThoseOfItsChannels) {
  EXPECT_EQ(frequenciesOf(Technology::lte, 1575).text(), "1842.5 MHz down, 1747.5 MHz up");
  EXPECT_EQ(frequenciesOf(Technology::umts, 10562).text(), "2112.4 MHz down, 1922.4 MHz up");
  EXPECT_EQ(frequenciesOf(Technology::gsm, 661, 310).text(), "1960.0 MHz down, 1880.0 MHz up");
  EXPECT_EQ(frequenciesOf(Technology::gsm, 661, 262).text(), "1835.0 MHz down, 1740.0 MHz up");
}

TEST(BandText, saysTheBandAsPeopleDo) {
  EXPECT_EQ(bandText(Technology::lte, 6300), "band 20");
  EXPECT_EQ(bandText(Technology::umts, 3011), "band VIII");
  EXPECT_EQ(bandText(Technology::umts, 4512), "band XX");
  EXPECT_EQ(bandText(Technology::umts, 4400), "") << "two bands have it";
  EXPECT_EQ(bandText(Technology::gsm, 62), "GSM 900");
  EXPECT_EQ(bandText(Technology::gsm, 661, 310), "PCS 1900");
  EXPECT_EQ(bandText(Technology::gsm, 661), "");
  EXPECT_EQ(bandText(Technology::lte, 5000), "");
}

}  // namespace
}  // namespace qel
