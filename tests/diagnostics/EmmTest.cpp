// Registration in LTE: from the modem's state and from messages in the clear.
#include <gtest/gtest.h>

#include "sources/Metrics.h"
#include "support/diagnostics/AirModem.h"
#include "support/diagnostics/LtePackets.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages
using nlohmann::json;

constexpr auto kContext = metric::kEmmContext;
constexpr auto kCommon = metric::kMmCommonInfo;

json status(unsigned state, unsigned substate) {
  AirModem modem;
  modem.send(kEmmState, emmState(state, substate));
  return modem.saying(kContext).value("reg_status", json());
}

TEST(EmmState, isHowFarThePhoneIsRegistered) {
  EXPECT_EQ(status(0, 0), "KREG_STATUS_REGISTRATION_SERVICE_DISABLED");
  EXPECT_EQ(status(1, 2), "KREG_STATUS_AT_NOT_REGISTERED");
  EXPECT_EQ(status(1, 3), "KREG_STATUS_NO_SERVICE");
  EXPECT_EQ(status(1, 6), "KREG_STATUS_LIMITED_SERVICE");
  EXPECT_EQ(status(2, 0), "KREG_STATUS_REGISTRATION_IN_PROGRESS");
  EXPECT_EQ(status(3, 0), "KREG_STATUS_NORMAL_SERVICE");
  EXPECT_EQ(status(3, 3), "KREG_STATUS_NO_SERVICE");
  EXPECT_EQ(status(3, 5), "KREG_STATUS_LIMITED_SERVICE");
  EXPECT_EQ(status(4, 0), "KREG_STATUS_REGISTRATION_IN_PROGRESS");
  EXPECT_EQ(status(5, 0), "KREG_STATUS_NORMAL_SERVICE");
  EXPECT_EQ(status(6, 0), "KREG_STATUS_SERVICE_DETACHED");
  EXPECT_EQ(status(3, 7), "KREG_STATUS_NORMAL_SERVICE") << "of a substate that is not known";
}

TEST(EmmState, tellsThePhonesTemporaryIdentity) {
  AirModem modem;
  EXPECT_EQ(modem.send(kEmmState, emmState(3, 0, WrittenGuti{})), ToldMetrics{kContext});
  EXPECT_EQ(modem.saying(kContext)["guti"],
            (json{{"mmegi", 0x8001}, {"mmec", 0x17}, {"m_tmsi", 0xC0FFEE01}}));
  modem.send(kEmmState, emmState(3, 0));
  EXPECT_TRUE(modem.saying(kContext).contains("guti")) << "not valid is not another one";
}

TEST(EmmState, thatCannotBeIsNotTaken) {
  AirModem modem;
  EXPECT_TRUE(modem.send(kEmmState, emmState(7, 0)).empty());
  EXPECT_EQ(modem.damaged(), 1U);
  Bytes newer = emmState(3, 0);
  newer[0] = 3;
  EXPECT_TRUE(modem.send(kEmmState, newer).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

TEST(EmmMessages, ofAttachingTellAreasIdentityTimersAndServices) {
  AirModem modem;
  EXPECT_EQ(modem.nas(kEmmOut, attachRequest(2)), ToldMetrics{kContext});
  EXPECT_EQ(modem.saying(kContext), (json{{"reg_status", "KREG_STATUS_REGISTRATION_IN_PROGRESS"},
                                          {"reg_proc", "EMM_PROC_ATTACH_COMB"}}));
  EXPECT_EQ(modem.nas(kEmmIn, attachAccept(0x49, areasValue({5, 9}),
                                           {gutiElement({}), featuresElement(true, false)})),
            ToldMetrics{kContext});
  const json context = modem.saying(kContext);
  EXPECT_EQ(context["reg_status"], "KREG_STATUS_NORMAL_SERVICE");
  EXPECT_EQ(context["update_status"], "EPS_STATUS_UPDATED");
  EXPECT_EQ(context["reject_cause"], "EMM_CAUSE_NO_CAUSE");
  EXPECT_EQ(context["t3412_dur_s"], 3240);
  EXPECT_EQ(context["guti"], (json{{"mmegi", 0x8001}, {"mmec", 0x17}, {"m_tmsi", 0xC0FFEE01}}));
  EXPECT_EQ(context["is_ims_voice_supported"], true);
  EXPECT_EQ(context["is_emerg_bearer_supported"], false);
  ASSERT_EQ(context["tai_list"].size(), 2U);
  EXPECT_EQ(context["tai_list"][1]["tac"], 9);
}

TEST(EmmMessages, tellWhichProcedureThePhoneAsksFor) {
  const auto procedure = [](const Bytes& message) {
    AirModem modem;
    modem.nas(kEmmOut, message);
    return modem.saying(kContext)["reg_proc"];
  };
  EXPECT_EQ(procedure(attachRequest(1)), "EMM_PROC_ATTACH");
  EXPECT_EQ(procedure(attachRequest(6)), "EMM_PROC_EMERGENCY_ATTACH");
  EXPECT_EQ(procedure(updateRequest(0)), "EMM_PROC_TAU");
  EXPECT_EQ(procedure(updateRequest(1)), "EMM_PROC_TAU_COMB");
  EXPECT_EQ(procedure(updateRequest(2)), "EMM_PROC_TAU_COMB");
  EXPECT_EQ(procedure(updateRequest(3)), "EMM_PROC_PERIODIC_TAU");
  EXPECT_EQ(procedure(updateRequest(8)), "EMM_PROC_TAU") << "bit 4 only asks to stay connected";
  EXPECT_EQ(procedure(serviceRequest()), "EMM_PROC_SERV_REQ");
}

TEST(EmmMessages, ofUpdatingTakeTheLongerTimer) {
  AirModem modem;
  modem.nas(kEmmIn, updateAccept({Bytes{0x5A, 0x49}, Bytes{0x5E, 1, 0x21}}));
  EXPECT_EQ(modem.saying(kContext)["t3412_dur_s"], 3600);
}

TEST(EmmMessages, ofRejectionTellTheCauseAndWhatFollows) {
  AirModem modem;
  modem.nas(kEmmIn, attachAccept(0x49, areasValue({5}), {gutiElement({})}));
  EXPECT_EQ(modem.nas(kEmmIn, updateReject(9)), ToldMetrics{kContext});
  EXPECT_EQ(modem.saying(kContext)["reject_cause"],
            "EMM_CAUSE_UE_IDENTITY_CANNOT_BE_DERIVED_BY_NETWORK");
  EXPECT_EQ(modem.saying(kContext)["update_status"], "EPS_STATUS_NOT_UPDATED");
  EXPECT_FALSE(modem.saying(kContext).contains("guti"));
  modem.nas(kEmmIn, attachReject(11));
  EXPECT_EQ(modem.saying(kContext)["reg_status"], "KREG_STATUS_REGISTRATION_FAILURE");
  EXPECT_EQ(modem.saying(kContext)["update_status"], "EPS_STATUS_ROAMING_NOT_ALLOWED");
  modem.nas(kEmmIn, serviceReject(22));
  EXPECT_EQ(modem.saying(kContext)["reject_cause"], "EMM_CAUSE_CONGESTION");
  EXPECT_EQ(modem.saying(kContext)["update_status"], "EPS_STATUS_ROAMING_NOT_ALLOWED");
}

TEST(EmmMessages, ofRefusedRoamingForgetTheIdentityWhenAttachingAlone) {
  for (const unsigned cause : {13U, 15U}) {
    AirModem modem;
    modem.nas(kEmmIn, attachAccept(0x49, areasValue({5}), {gutiElement({})}));
    modem.nas(kEmmIn, updateReject(cause));
    EXPECT_TRUE(modem.saying(kContext).contains("guti")) << cause;
    EXPECT_EQ(modem.reader().picture().nas.emm.areas.size(), 1U);
    modem.nas(kEmmIn, attachReject(cause));
    EXPECT_FALSE(modem.saying(kContext).contains("guti")) << cause;
    EXPECT_TRUE(modem.reader().picture().nas.emm.areas.empty());
  }
}

TEST(EmmMessages, leaveTheStatusToTheModemWhereItTellsIt) {
  AirModem modem;
  modem.send(kEmmState, emmState(3, 0));
  modem.nas(kEmmOut, updateRequest(0));
  EXPECT_EQ(modem.saying(kContext)["reg_status"], "KREG_STATUS_NORMAL_SERVICE");
}

TEST(EmmMessages, tellEquivalentNetworksUntilTheNextList) {
  AirModem modem;
  const auto equivalents = equivalentsElement({0x62F210, 0x62F220});
  EXPECT_EQ(modem.nas(kEmmIn, updateAccept({equivalents})), (ToldMetrics{kCommon, kContext}));
  EXPECT_EQ(modem.saying(kCommon)["eplmn_list"].size(), 2U);
  EXPECT_EQ(modem.nas(kEmmIn, updateAccept({})), (ToldMetrics{kCommon, kContext}));
  EXPECT_TRUE(modem.saying(kCommon)["eplmn_list"].empty());
  EXPECT_EQ(modem.nas(kEmmIn, updateAccept({})), ToldMetrics{kContext});
}

TEST(EmmMessages, rememberTheAreasThatRefusedThePhoneUntilOneAccepts) {
  AirModem modem;
  modem.send(0xB0C2, lteServingCell(3));
  const std::uint32_t area = modem.reader().picture().lte.serving->area;
  EXPECT_EQ(modem.nas(kEmmIn, updateReject(15)), (ToldMetrics{kCommon, kContext}));
  modem.nas(kEmmIn, updateReject(12));
  const json common = modem.saying(kCommon);
  ASSERT_EQ(common["roaming_ftai_list"].size(), 1U);
  EXPECT_EQ(common["roaming_ftai_list"][0]["tac"], area);
  ASSERT_EQ(common["reg_prov_ftai_list"].size(), 1U);
  const auto& known = modem.reader().picture().nas.common.noRoamingTracking[0];
  const Bytes accepted = BodyWriter()
                             .u8(0)
                             .bytes(Bytes(known.plmn.begin(), known.plmn.end()))
                             .u8(area >> 8U)
                             .u8(area & 0xFFU);
  modem.nas(kEmmIn, attachAccept(0x49, accepted));
  EXPECT_TRUE(modem.reader().picture().nas.common.noRoamingTracking.empty());
  EXPECT_TRUE(modem.reader().picture().nas.common.noServiceTracking.empty());
}

TEST(EmmMessages, ofDetachingEndTheConnections) {
  const auto connections = [](std::uint16_t code, unsigned type) {
    AirModem modem;
    modem.nas(kEsmIn, activateConnection({}));
    modem.nas(code, detachRequest(type));
    return modem.saying(metric::kBearers)["bearer_context_count"];
  };
  EXPECT_EQ(connections(kEmmIn, 1), 0);
  EXPECT_EQ(connections(kEmmIn, 3), 1) << "the network ends circuit-switched service alone";
  EXPECT_EQ(connections(kEmmOut, 2), 1) << "so does the phone";
  EXPECT_EQ(connections(kEmmOut, 1), 0);
}

TEST(EmmMessages, endConnectionsThatTheNetworkDoesNotKnow) {
  AirModem modem;
  modem.nas(kEsmIn, activateConnection({.bearer = 5}));
  modem.nas(kEsmIn, activateConnection({.bearer = 6, .apn = "ims"}));
  modem.nas(kEmmIn, updateAccept({Bytes{0x57, 2, 0x40, 0x00}}));
  const json bearers = modem.saying(metric::kBearers)["bearer_contexts"];
  ASSERT_EQ(bearers.size(), 1U);
  EXPECT_EQ(bearers[0]["nsapi"], 6);
}

TEST(EmmMessages, thatAreCipheredOrOfNoInterestTellNothing) {
  AirModem modem;
  EXPECT_TRUE(modem.nas(kEmmIn, Bytes{0x27, 1, 2, 3, 4, 5, 6, 7}).empty());
  EXPECT_TRUE(modem.nas(kEmmIn, Bytes{0x07, 0x61, 0x43}).empty());
  EXPECT_EQ(modem.reader().counts().total().notOurs, 2U);
  EXPECT_TRUE(modem.send(kEmmIn, plainNas(attachReject(11), 2)).empty());
  EXPECT_EQ(modem.ofUnknownVersion(), 1U);
}

TEST(EmmMessages, areReadBehindAnIntegrityHeader) {
  AirModem modem;
  Bytes message = {0x17, 1, 2, 3, 4, 5};
  const Bytes inner = attachReject(11);
  message.insert(message.end(), inner.begin(), inner.end());
  EXPECT_EQ(modem.nas(kEmmIn, message), ToldMetrics{kContext});
}

}  // namespace
}  // namespace qel::diagnostics
