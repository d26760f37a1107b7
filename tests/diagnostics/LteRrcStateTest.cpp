// LTE's connection: from the modem's events, from messages, and from both.
#include <gtest/gtest.h>

#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages
using nlohmann::json;

constexpr auto kState = metric::kLteRrcState;
constexpr auto kFailure = metric::kLteRadioLinkFailure;

TEST(LteRrcState, isWhatTheModemsEventsSay) {
  const std::vector<std::pair<std::uint8_t, const char*>> states = {
      {2, "KLTE_RRC_STATE_IDLE"},
      {3, "KLTE_RRC_STATE_ATMPT_CONNECTION"},
      {4, "KLTE_RRC_STATE_CONNECTED"},
      {5, "KLTE_RRC_STATE_ATMPT_OUTBND_MOBILITY"},
      {6, "KLTE_RRC_STATE_ATMPT_INBND_MOBILITY"},
      {7, "KLTE_RRC_STATE_ENDING"},
      {0, "KLTE_RRC_STATE_NULL"}};
  AirModem modem;
  for (const auto& [code, name] : states) {
    EXPECT_EQ(modem.state(code), ToldMetrics{kState});
    EXPECT_EQ(modem.saying(kState)["state"], name);
  }
}

TEST(LteRrcState, thatTheModemRepeatsIsToldOnce) {
  AirModem modem;
  modem.state(2);
  EXPECT_TRUE(modem.state(2).empty());
  modem.state(0);
  EXPECT_TRUE(modem.state(1).empty()) << "both are without a cell";
}

TEST(LteRrcState, tellsTheOneBeforeAndHowLongItLasted) {
  AirModem modem;
  modem.state(2);
  EXPECT_FALSE(modem.saying(kState).contains("prev_state"));
  modem.wait(1234);
  modem.state(3);
  EXPECT_EQ(modem.saying(kState), (json{{"state", "KLTE_RRC_STATE_ATMPT_CONNECTION"},
                                        {"prev_state", "KLTE_RRC_STATE_IDLE"},
                                        {"prev_state_dur_ms", 1234}}));
}

TEST(LteRrcState, ofADamagedEventIsNotTaken) {
  AirModem modem;
  for (const Bytes& payload : {Bytes{}, Bytes{8}, Bytes{2, 0}}) {
    EXPECT_TRUE(modem.sendEvent(kStateEvent, payload).empty());
  }
  EXPECT_EQ(modem.damaged(), 3U);
  EXPECT_TRUE(modem.saying(kState).is_null());
}

TEST(LteRrcState, followsFromMessagesWithoutEvents) {
  AirModem modem;
  EXPECT_EQ(modem.air(AirChannel::ulCcch, connectionRequest(4)), ToldMetrics{kState});
  EXPECT_EQ(modem.saying(kState), (json{{"state", "KLTE_RRC_STATE_ATMPT_CONNECTION"},
                                        {"cause", "KLTE_RRC_CAUSE_EST_MO_DATA"}}));
  EXPECT_TRUE(modem.air(AirChannel::dlCcch, plainSetup()).empty());
  EXPECT_EQ(modem.air(AirChannel::ulDcch, setupComplete()), ToldMetrics{kState});
  EXPECT_EQ(modem.saying(kState)["state"], "KLTE_RRC_STATE_CONNECTED");
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_EST_MO_DATA");
  EXPECT_TRUE(modem.air(AirChannel::dlDcch, ciphering()).empty());
  modem.wait(5000);
  EXPECT_EQ(modem.air(AirChannel::dlDcch, connectionRelease(1)), ToldMetrics{kState});
  EXPECT_EQ(modem.saying(kState), (json{{"state", "KLTE_RRC_STATE_IDLE"},
                                        {"prev_state", "KLTE_RRC_STATE_ENDING"},
                                        {"prev_state_dur_ms", 0},
                                        {"cause", "KLTE_RRC_CAUSE_REL_OTHER"}}));
}

TEST(LteRrcState, isConnectedWhereTheBeginningWasMissed) {
  AirModem modem;
  EXPECT_EQ(modem.air(AirChannel::dlDcch, ciphering()), ToldMetrics{kState});
  EXPECT_EQ(modem.saying(kState), (json{{"state", "KLTE_RRC_STATE_CONNECTED"}}));
}

TEST(LteRrcState, hasTheCausesOfTheStandardInItsOrder) {
  const std::vector<json> establishment = {"KLTE_RRC_CAUSE_EST_EMERGENCY",
                                           "KLTE_RRC_CAUSE_EST_HIGH_PRIO_ACC",
                                           "KLTE_RRC_CAUSE_EST_MT_ACC",
                                           "KLTE_RRC_CAUSE_EST_MO_SIGNAL",
                                           "KLTE_RRC_CAUSE_EST_MO_DATA",
                                           "KLTE_RRC_CAUSE_EST_DELAY_TOL_ACC",
                                           json(),   // a voice call has none
                                           json()};  // a spare value
  for (unsigned cause = 0; cause < establishment.size(); ++cause) {
    AirModem modem;
    modem.air(AirChannel::ulCcch, connectionRequest(cause));
    EXPECT_EQ(modem.saying(kState).value("cause", json()), establishment[cause]);
  }
  const std::vector<json> release = {"KLTE_RRC_CAUSE_REL_LOAD_BAL_TAU_REQD",
                                     "KLTE_RRC_CAUSE_REL_OTHER",
                                     "KLTE_RRC_CAUSE_REL_CSFB_HIGH_PRIO", json()};
  for (unsigned cause = 0; cause < release.size(); ++cause) {
    AirModem modem;
    modem.air(AirChannel::dlDcch, connectionRelease(cause));
    EXPECT_EQ(modem.saying(kState).value("cause", json()), release[cause]);
  }
}

TEST(LteRrcState, isIdleWhenTheNetworkRejects) {
  AirModem modem;
  modem.air(AirChannel::ulCcch, connectionRequest(3));
  EXPECT_EQ(modem.air(AirChannel::dlCcch, connectionReject()), ToldMetrics{kState});
  EXPECT_EQ(modem.saying(kState)["state"], "KLTE_RRC_STATE_IDLE");
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_EST_FAIL_REJ");
}

TEST(LteRrcState, leavesForAnotherTechnology) {
  AirModem modem;
  modem.air(AirChannel::dlDcch, ciphering());
  EXPECT_EQ(modem.air(AirChannel::dlDcch, mobilityToUmts()), ToldMetrics{kState});
  EXPECT_EQ(modem.saying(kState)["state"], "KLTE_RRC_STATE_ATMPT_OUTBND_MOBILITY");
}

TEST(LteRrcState, thatEventsTellTakesItsCauseFromMessages) {
  AirModem modem;
  modem.state(2);
  EXPECT_TRUE(modem.air(AirChannel::ulCcch, connectionRequest(2)).empty()) << "the event tells it";
  EXPECT_EQ(modem.state(3), ToldMetrics{kState});
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_EST_MT_ACC");
  EXPECT_TRUE(modem.air(AirChannel::ulDcch, setupComplete()).empty());
  modem.state(4);
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_EST_MT_ACC") << "it led here too";
  EXPECT_TRUE(modem.air(AirChannel::dlDcch, connectionRelease(1)).empty());
  modem.state(7);
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_REL_OTHER");
  modem.state(2);
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_REL_OTHER");
}

TEST(LteRrcState, takesACauseThatComesBehindItsEvent) {
  AirModem modem;
  modem.state(3);
  EXPECT_TRUE(modem.air(AirChannel::ulCcch, connectionRequest(4)).empty());
  modem.state(4);
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_EST_MO_DATA");
}

TEST(LteRrcState, takesNoCauseOfLongAgoNorOfAnotherKind) {
  AirModem modem;
  modem.state(2);
  modem.air(AirChannel::ulCcch, connectionRequest(4));
  modem.wait(10'001);
  modem.state(3);
  EXPECT_FALSE(modem.saying(kState).contains("cause"));
  modem.state(4);
  modem.wait(20'000);
  modem.air(AirChannel::ulCcch, connectionRequest(4));
  modem.state(7);
  EXPECT_FALSE(modem.saying(kState).contains("cause")) << "a cause of beginning is none of ending";
}

TEST(LteRrcState, isWithoutServiceWhenTheModemSaysSo) {
  AirModem modem;
  modem.state(2);
  EXPECT_TRUE(modem.sendEvent(kOutOfServiceEvent, {}).empty());
  modem.state(1);
  EXPECT_EQ(modem.saying(kState)["state"], "KLTE_RRC_STATE_NULL");
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_NO_SERVICE");
}

// Field 2 of the report, after the time.
std::optional<std::uint64_t> failureCause(const AirModem& modem) {
  const auto payload = modem.reader().report(kFailure, 1);
  if (!payload) return std::nullopt;
  EXPECT_EQ((*payload)[0], 0x08);
  std::size_t at = 1;
  while (((*payload)[at] & 0x80) != 0) ++at;
  ++at;
  if (payload->size() == at) return 255;
  EXPECT_EQ(payload->size(), at + 2);
  EXPECT_EQ((*payload)[at], 0x10);
  return (*payload)[at + 1];
}

TEST(LteRadioLinkFailure, isToldByItsEvent) {
  AirModem modem;
  EXPECT_EQ(failureCause(modem), std::nullopt);
  EXPECT_EQ(modem.sendEvent(kLinkFailureEvent, Bytes{1, 0}), ToldMetrics{kFailure});
  EXPECT_EQ(failureCause(modem), 255U) << "of the event's cause the values are not known";
  EXPECT_TRUE(modem.sendEvent(kLinkFailureEvent, Bytes{1}).empty());
  EXPECT_EQ(modem.damaged(), 1U);
}

TEST(LteRadioLinkFailure, isToldByTheRequestForReestablishment) {
  for (unsigned cause = 0; cause < 3; ++cause) {
    AirModem modem;
    modem.air(AirChannel::dlDcch, ciphering());
    EXPECT_EQ(modem.air(AirChannel::ulCcch, reestablishmentRequest(301, cause)),
              (ToldMetrics{kFailure, kState}));
    EXPECT_EQ(failureCause(modem), 6 + cause);
    EXPECT_EQ(modem.saying(kState)["state"], "KLTE_RRC_STATE_ATMPT_CONNECTION");
  }
}

TEST(LteRadioLinkFailure, keepsItsCauseWhenTheEventComesBehind) {
  AirModem modem;
  modem.state(4);
  EXPECT_EQ(modem.air(AirChannel::ulCcch, reestablishmentRequest(301, 2)), ToldMetrics{kFailure});
  modem.sendEvent(kLinkFailureEvent, Bytes{1, 0});
  EXPECT_EQ(failureCause(modem), 8U);
}

TEST(LteRadioLinkFailure, endsInIdleWhenTheNetworkRejects) {
  AirModem modem;
  modem.air(AirChannel::ulCcch, reestablishmentRequest(301, 2));
  modem.air(AirChannel::dlCcch, reestablishmentReject());
  EXPECT_EQ(modem.saying(kState)["state"], "KLTE_RRC_STATE_IDLE");
  EXPECT_EQ(modem.saying(kState)["cause"], "KLTE_RRC_CAUSE_REL_CONN_FAIL_REEST_REJ");
}

TEST(LteRadioLinkFailure, hasItsOwnTimeAndIsNewsForHalfAMinute) {
  AirModem modem;
  const auto payload = [&] { return modem.reader().report(kFailure, 1'790'000'099'000); };
  modem.setTime(1'790'000'000'000);
  modem.sendEvent(kLinkFailureEvent, Bytes{1, 0});
  const auto first = payload();
  modem.wait(20'000);
  modem.air(AirChannel::dlDcch, ciphering());
  EXPECT_EQ(payload(), first);
  modem.sendEvent(kLinkFailureEvent, Bytes{2, 0});
  EXPECT_NE(payload(), first);
  modem.wait(30'001);
  modem.air(AirChannel::dlDcch, ciphering());
  EXPECT_EQ(payload(), std::nullopt);
}

}  // namespace
}  // namespace qel::diagnostics
