// What the phone sends on LTE.

#include <gtest/gtest.h>

#include "support/diagnostics/LtePackets.h"

namespace qel::diagnostics {
namespace {

using test::LteModem;
using test::ltePucch;
using test::ltePusch;
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kPusch = 0xB16E;
constexpr std::uint16_t kPucch = 0xB16F;
constexpr std::uint32_t kPower = 54018;

TEST(LtePower, ofTheSharedChannelIsReadInEveryVersion) {
  for (const unsigned version : {4U, 5U, 25U}) {
    LteModem modem;
    EXPECT_EQ(modem.send(kPusch, ltePusch(version, {{1, 23}, {9, -40}})), Metrics{kPower})
        << version;
    EXPECT_EQ(modem.said(kPower),
              R"({"tx_power_info": [{"pusch_tx_power": 23, "subframe_index": 1}, )"
              R"({"pusch_tx_power": -40, "subframe_index": 9}]})");
  }
}

TEST(LtePower, ofTheControlChannelIsReadInEveryVersion) {
  for (const unsigned version : {4U, 24U}) {
    LteModem modem;
    EXPECT_EQ(modem.send(kPucch, ltePucch(version, {{0, -7}})), Metrics{kPower}) << version;
    EXPECT_EQ(modem.said(kPower),
              R"({"tx_power_info": [{"pucch_tx_power": -7, "subframe_index": 0}]})");
  }
}

TEST(LtePower, ofBothChannelsIsToldTogether) {
  LteModem modem;
  modem.send(kPucch, ltePucch(4, {{2, -7}}));
  modem.send(kPusch, ltePusch(5, {{3, 10}}));
  EXPECT_EQ(modem.said(kPower),
            R"({"tx_power_info": [{"pusch_tx_power": 10, "subframe_index": 3}, )"
            R"({"pucch_tx_power": -7, "subframe_index": 2}]})");
}

TEST(LtePower, isForgottenAfterTenSeconds) {
  LteModem modem;
  modem.send(kPucch, ltePucch(4, {{2, -7}}));
  modem.wait(10'001);
  modem.send(0xB0FF, {});
  EXPECT_EQ(modem.said(kPower), "");
}

TEST(LtePower, ofASubframeThatThereIsNotIsDamaged) {
  LteModem modem;
  EXPECT_TRUE(modem.send(kPusch, ltePusch(5, {{1, 23}, {10, 3}})).empty());
  EXPECT_EQ(modem.damaged(), 1U);
  EXPECT_EQ(modem.said(kPower), "");
}

TEST(LtePower, ofNoSubframeTellsNothing) {
  LteModem modem;
  EXPECT_TRUE(modem.send(kPusch, ltePusch(5, {})).empty());
  EXPECT_EQ(modem.understood(), 1U);
}

TEST(LtePower, ofALaterVersionTellsNothing) {
  LteModem modem;
  EXPECT_TRUE(modem.send(kPusch, ltePusch(48, {{1, 23}})).empty());
  EXPECT_TRUE(modem.send(kPucch, ltePucch(48, {{1, 23}})).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 2U);
}

}  // namespace
}  // namespace qel::diagnostics
