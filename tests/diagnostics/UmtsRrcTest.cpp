// Why connections begin and end, from UMTS's RRC messages.

#include <gtest/gtest.h>

#include "messages/wcdma.h"
#include "support/diagnostics/UmtsMessages.h"
#include "support/diagnostics/UmtsPackets.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kMessage = 0x412F;
constexpr std::uint16_t kState = 0x4125;
constexpr std::uint32_t kRrcState = 53522;

constexpr unsigned kUlCcch = 0;
constexpr unsigned kDlCcch = 2;
constexpr unsigned kDlDcch = 3;

std::string inState(const std::string& state, const std::string& causes = {}) {
  return R"({"state": "KWCDMA_RRC_CONN_STATE_)" + state + '"' + causes + '}';
}

TEST(UmtsRequest, saysWhyAConnectionIsWanted) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kMessage, umtsRrc(kUlCcch, umtsConnectionRequest(12))), Metrics{kRrcState});
  EXPECT_EQ(modem.said(kRrcState),
            inState("ESTABLISH", R"(, "establishment_cause": "KRRC_EST_REGISTRATION")"));
}

TEST(UmtsRequest, givesItsCauseToTheStatesThatFollow) {
  UmtsModem modem;
  modem.send(kMessage, umtsRrc(kUlCcch, umtsConnectionRequest(2)));
  const std::string cause = R"(, "establishment_cause": "KRRC_EST_ORIG_INTERACT_CALL")";
  modem.send(kState, Bytes{1});
  EXPECT_EQ(modem.said(kRrcState), inState("ESTABLISH", cause));
  modem.send(kState, Bytes{3});
  EXPECT_EQ(modem.said(kRrcState), inState("CELL_DCH", cause));
  modem.send(kState, Bytes{0});
  EXPECT_EQ(modem.said(kRrcState), inState("IDLE"));
}

TEST(UmtsRequest, withASpareCauseHasNone) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kMessage, umtsRrc(kUlCcch, umtsConnectionRequest(22))), Metrics{kRrcState});
  EXPECT_EQ(modem.said(kRrcState),
            inState("ESTABLISH", R"(, "establishment_cause": "KRRC_EST_DELAY_TOLERANT_ACCESS")"));
  modem.send(kMessage, umtsRrc(kUlCcch, umtsConnectionRequest(23)));
  EXPECT_EQ(modem.said(kRrcState), inState("ESTABLISH"));
}

TEST(UmtsRelease, saysWhyAConnectionEnds) {
  const std::pair<unsigned, const char*> kCauses[] = {
      {0, "NORMAL_EVENT"}, {1, "OTHER_CAUSE"}, {3, "OTHER_CAUSE"}, {6, "INACTIVE"}};
  for (const auto& [cause, name] : kCauses) {
    for (const auto release : {umtsConnectionRelease, umtsConnectionReleaseOfRelease4}) {
      UmtsModem modem;
      modem.send(kState, Bytes{3});
      EXPECT_EQ(modem.send(kMessage, umtsRrc(kDlDcch, release(cause))), Metrics{kRrcState});
      const std::string causes = std::string(R"(, "release_cause": "KRRC_REL_)") + name + '"';
      EXPECT_EQ(modem.said(kRrcState), inState("RELEASE", causes));
      modem.send(kState, Bytes{0});
      EXPECT_EQ(modem.said(kRrcState), inState("IDLE", causes));
      modem.send(kState, Bytes{1});
      EXPECT_EQ(modem.said(kRrcState), inState("ESTABLISH"));
    }
  }
}

TEST(UmtsRejection, saysWhyNoConnectionCameAbout) {
  UmtsModem modem;
  modem.send(kMessage, umtsRrc(kUlCcch, umtsConnectionRequest(12)));
  EXPECT_EQ(modem.send(kMessage, umtsRrc(kDlCcch, umtsConnectionReject(0))), Metrics{kRrcState});
  EXPECT_NE(modem.said(kRrcState).find("KRRC_REL_CONN_REJECT_CONGESTION"), std::string::npos);
  modem.send(kMessage, umtsRrc(kDlCcch, umtsConnectionReject(1)));
  EXPECT_NE(modem.said(kRrcState).find("KRRC_REL_CONN_REJECT_UNSPECIFIED"), std::string::npos);
}

TEST(UmtsRejection, ofAnotherPhoneIsPassedOver) {
  UmtsModem modem;
  EXPECT_TRUE(modem.send(kMessage, umtsRrc(kDlCcch, umtsConnectionReject(0))).empty());
  EXPECT_TRUE(modem.send(kMessage, umtsRrc(kDlDcch, umtsConnectionRelease(0))).empty());
  EXPECT_EQ(modem.said(kRrcState), "");
  EXPECT_EQ(modem.understood(), 2U);
}

TEST(UmtsRrcMessage, isFoundBehindItsCellAsWell) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kMessage, umtsRrcOf(0x80 + kUlCcch, 10638, 407, umtsConnectionRequest(13))),
            Metrics{kRrcState});
  EXPECT_NE(modem.said(kRrcState).find("KRRC_EST_DETACH"), std::string::npos);
}

TEST(UmtsRrcMessage, onAChannelThatTellsNothingIsNotOurs) {
  UmtsModem modem;
  for (const unsigned channel : {1U, 5U, 6U, 7U, 8U, 10U, 0x86U, 0x8AU, 0xEFU}) {
    EXPECT_TRUE(modem.send(kMessage, umtsRrc(channel, Bytes(20))).empty()) << channel;
  }
  EXPECT_EQ(modem.reader().counts().total().notOurs, 9U);
}

TEST(UmtsRrcMessage, ofAnotherLengthThanItSaysIsDamaged) {
  UmtsModem modem;
  Bytes body = umtsRrc(kUlCcch, umtsConnectionRequest(12));
  body.push_back(0);
  EXPECT_TRUE(modem.send(kMessage, body).empty());
  body.resize(3);
  EXPECT_TRUE(modem.send(kMessage, body).empty());
  EXPECT_TRUE(modem.send(kMessage, umtsRrc(kUlCcch, {})).empty());
  EXPECT_TRUE(modem.send(kMessage, umtsRrc(9, {})).empty());
  EXPECT_EQ(modem.damaged(), 4U);
}

}  // namespace
}  // namespace qel::diagnostics
