#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "history/Followed.h"
#include "messages/lte_neighbours.h"
#include "messages/nas.h"
#include "messages/wcdma.h"

namespace qel {
namespace {

using ::testing::ElementsAre;
using testing::Followed;
using ::testing::IsEmpty;
using V = MetricValidator;
using Kind = HappeningKind;

constexpr std::uint64_t kStart = 1'500'000'000'000;

void umtsState(Followed& followed, std::uint64_t timeMs, std::int32_t state, std::int32_t asked,
               std::int32_t released) {
  KCellularWcdmaRrcConnectionState message;
  message.setState(state);
  message.setEstablishmentCause(asked);
  message.setReleaseCause(released);
  followed.feed(timeMs, V::K_UMTS_RRC_STATE, message);
}

TEST(RrcHappenings, nameStateAndCauseInWords) {
  Followed followed;
  followed.lteState(kStart, 2, 4);
  followed.lteState(kStart + 1, 3, 4);
  followed.lteState(kStart + 2, 3, 4);  // a repeat
  followed.lteState(kStart + 3, 1, 255);
  followed.lteState(kStart + 4, 99, 1000);
  EXPECT_THAT(followed.texts(Kind::rrc),
              ElementsAre("LTE RRC: asking for a connection, data from the phone",
                          "LTE RRC: connected, data from the phone", "LTE RRC: idle",
                          "LTE RRC: state 99, cause 1000"));
}

TEST(RrcHappenings, nameTheCauseThatBelongsToAUmtsState) {
  Followed followed;
  umtsState(followed, kStart, 7, 12, 4);
  umtsState(followed, kStart + 1, 8, 12, 4);
  umtsState(followed, kStart + 2, 2, 12, 4);
  EXPECT_THAT(
      followed.texts(Kind::rrc),
      ElementsAre("UMTS RRC: connected on a dedicated channel (CELL_DCH), registration",
                  "UMTS RRC: releasing the connection, normal end", "UMTS RRC: idle, normal end"));
}

TEST(RrcHappenings, tellNothingOfAReportWithoutAState) {
  Followed followed;
  followed.feed(kStart, V::K_LTE_RRC_STATE, KCellularLteRrcState());
  followed.feed(kStart, V::K_UMTS_RRC_STATE, KCellularWcdmaRrcConnectionState());
  EXPECT_TRUE(followed.history.happenings().empty());
}

TEST(RadioLinkFailures, areToldOnceForAllTheReportsOfOne) {
  Followed followed;
  followed.lteState(kStart, 3, 4);
  followed.feed(kStart + 1000, V::K_LTE_RLF, Bytes{1, 2, 3});
  followed.lteState(kStart + 1001, 2, 27);
  followed.lteState(kStart + 4000, 3, 27);
  followed.lteState(kStart + 4001, 3, 27);
  EXPECT_THAT(followed.texts(Kind::radioLinkFailure), ElementsAre("Radio link failure on LTE"));
  EXPECT_EQ(followed.happenings(Kind::radioLinkFailure)[0].metric, V::K_LTE_RLF);
}

TEST(RadioLinkFailures, comeAgainWithTheSameCause) {
  Followed followed;
  for (std::uint64_t i = 0; i < 3; ++i) {
    followed.lteState(kStart + 10'000 * i, 3, 27);
    followed.lteState(kStart + 10'000 * i + 5000, 2, 27);
  }
  EXPECT_EQ(followed.texts(Kind::radioLinkFailure).size(), 4U) << "the first report told one too";
  EXPECT_EQ(followed.texts(Kind::radioLinkFailure).back(),
            "Radio link failure on LTE: out of sync, T310 ended");
}

TEST(RadioLinkFailures, areNotInventedForOtherReestablishments) {
  for (const std::int32_t cause : {6, 7, 8, 30}) {
    Followed followed;
    followed.lteState(kStart, 3, 4);
    followed.lteState(kStart + 1, 2, cause);
    EXPECT_THAT(followed.texts(Kind::radioLinkFailure), IsEmpty()) << cause;
    EXPECT_EQ(followed.texts(Kind::rrc).size(), 2U);
  }
}

TEST(RadioLinkFailures, ofUmtsAreAState) {
  Followed followed;
  umtsState(followed, kStart, 7, 12, 4);
  umtsState(followed, kStart + 1, 9, 12, 13);
  umtsState(followed, kStart + 2, 9, 12, 13);
  EXPECT_THAT(followed.texts(Kind::radioLinkFailure), ElementsAre("Radio link failure on UMTS"));
}

KCellularEmmContext emm(std::optional<std::int32_t> status, std::optional<std::int32_t> reject = {},
                        std::optional<std::int32_t> procedure = {}) {
  KCellularEmmContext context;
  if (status) context.setRegStatus(*status);
  if (reject) context.setRejectCause(*reject);
  if (procedure) context.setRegProc(*procedure);
  return context;
}

TEST(RegistrationHappenings, tellChangesAndNeitherRepeatsNorWhatIsNotThere) {
  Followed followed;
  followed.feed(kStart, V::K_LTE_EMM_CTXT, emm(11, 0, 1));
  followed.feed(kStart + 1, V::K_LTE_EMM_CTXT, emm(11, 0, 1));
  followed.feed(kStart + 2, V::K_LTE_EMM_CTXT, emm({}));
  followed.feed(kStart + 3, V::K_LTE_EMM_CTXT, emm(0));
  followed.feed(kStart + 4, V::K_LTE_EMM_CTXT, emm(0, 0, 0));
  EXPECT_THAT(followed.texts(Kind::registration),
              ElementsAre("LTE: registering", "LTE: registered, all services"));
  EXPECT_THAT(followed.texts(Kind::reject), IsEmpty());
}

TEST(RegistrationHappenings, keepTheDomainsApart) {
  Followed followed;
  KCellularMmContext calls;
  calls.setRegStatus(3);
  followed.feed(kStart, V::K_CELLULAR_MM_CTXT, calls);
  KCellularGmmContext packets;
  packets.setRegStatus(3);
  followed.feed(kStart, V::K_CELLULAR_GMM_CTXT, packets);
  EXPECT_THAT(
      followed.texts(Kind::registration),
      ElementsAre("Calls of 2G and 3G: no service", "Packet service of 2G and 3G: no service"));
  EXPECT_FALSE(followed.happenings(Kind::registration)[0].technology);
}

TEST(RejectHappenings, nameProcedureAndCauseWithItsNumber) {
  Followed followed;
  followed.feed(kStart, V::K_LTE_EMM_CTXT, emm(1, 11, 1));
  followed.feed(kStart + 1, V::K_LTE_EMM_CTXT, emm(1, 11, 1));
  followed.feed(kStart + 2, V::K_LTE_EMM_CTXT, emm(1, 15, 4));
  followed.feed(kStart + 3, V::K_LTE_EMM_CTXT, emm(0, 0, 0));
  followed.feed(kStart + 4, V::K_LTE_EMM_CTXT, emm(1, 15));
  followed.feed(kStart + 5, V::K_LTE_EMM_CTXT, emm(1, 111));
  EXPECT_THAT(followed.texts(Kind::reject),
              ElementsAre("LTE: attach rejected, network not allowed (cause 11)",
                          "LTE: tracking area update rejected, no suitable cell in this tracking "
                          "area (cause 15)",
                          "LTE: registration rejected, no suitable cell in this tracking area "
                          "(cause 15)",
                          "LTE: registration rejected, cause 111"));
}

TEST(RejectHappenings, tellAFailureThatIsNone) {
  Followed followed;
  KCellularMmContext context;
  context.setProcFailureCause(5);
  followed.feed(kStart, V::K_CELLULAR_MM_CTXT, context);
  context.setProcFailureCause(11);
  context.setRejectCause(17);
  followed.feed(kStart + 1, V::K_CELLULAR_MM_CTXT, context);
  EXPECT_THAT(followed.texts(Kind::registration),
              ElementsAre("Calls of 2G and 3G: failed, no answer to the location update"));
  EXPECT_THAT(followed.texts(Kind::reject),
              ElementsAre("Calls of 2G and 3G: registration rejected, network failure (cause 17)"));
}

std::shared_ptr<BearerContext> bearer(std::uint32_t cid, const std::string& apn) {
  auto context = std::make_shared<BearerContext>();
  context->setCid(cid);
  context->setApn(apn);
  context->setPdpType(2);
  context->setPdpAddr(Bytes{192, 0, 2, 17});
  return context;
}

TEST(BearerHappenings, tellWhatComesAndGoesWithoutItsAddress) {
  Followed followed;
  KCellularActivatedBearerContexts list;
  list.addBearerContexts(bearer(1, "internet"));
  followed.feed(kStart, V::K_CELLULAR_ACTIVE_BEARER, list);
  followed.feed(kStart + 1, V::K_CELLULAR_ACTIVE_BEARER, list);
  list.addBearerContexts(bearer(2, "ims"));
  followed.feed(kStart + 2, V::K_CELLULAR_ACTIVE_BEARER, list);
  followed.feed(kStart + 3, V::K_CELLULAR_ACTIVE_BEARER, KCellularActivatedBearerContexts());
  EXPECT_THAT(followed.texts(Kind::bearer), ElementsAre("Connection up: internet, IPv4 and IPv6",
                                                        "Connection up: ims, IPv4 and IPv6",
                                                        "Connection down: internet, IPv4 and IPv6",
                                                        "Connection down: ims, IPv4 and IPv6"));
}

TEST(BearerHappenings, lookAtNoMoreThanSixtyFour) {
  Followed followed;
  KCellularActivatedBearerContexts list;
  for (std::uint32_t i = 0; i < 200; ++i) list.addBearerContexts(bearer(i, std::string(300, 'a')));
  followed.feed(kStart, V::K_CELLULAR_ACTIVE_BEARER, list);
  const auto texts = followed.texts(Kind::bearer);
  ASSERT_EQ(texts.size(), 64U);
  EXPECT_EQ(texts[0], "Connection up: " + std::string(100, 'a') + ", IPv4 and IPv6");
}

TEST(BearerHappenings, areTextWhateverTheNameIs) {
  Followed followed;
  KCellularActivatedBearerContexts list;
  list.addBearerContexts(bearer(1, std::string(99, 'a') + "\u00e9b"));  // cut within a character
  list.addBearerContexts(bearer(2, "in\xFFternet"));
  followed.feed(kStart, V::K_CELLULAR_ACTIVE_BEARER, list);
  EXPECT_THAT(followed.texts(Kind::bearer),
              ElementsAre("Connection up: " + std::string(99, 'a') + ", IPv4 and IPv6",
                          "Connection up: in\uFFFDternet, IPv4 and IPv6"));
}

std::shared_ptr<SecondaryComponentCarrier> carrier(std::uint32_t pci, std::int32_t state) {
  auto one = std::make_shared<SecondaryComponentCarrier>();
  one->setIndex(1);
  one->setState(state);
  one->setPci(pci);
  one->setDlEarfcn(700);
  one->setDlRfBand(2);
  return one;
}

TEST(CarrierHappenings, tellWhatIsAddedAndRemoved) {
  Followed followed;
  const auto report = [&](std::uint64_t timeMs, std::shared_ptr<SecondaryComponentCarrier> one) {
    KCellularLteCarrierAggregationStatus list;
    if (one) list.addSccList(std::move(one));
    followed.feed(timeMs, V::K_LTE_CA_STATUS, list);
  };
  report(kStart, nullptr);
  report(kStart + 1, carrier(5, 1));
  report(kStart + 2, carrier(5, 2));  // activated: no other carrier
  report(kStart + 3, carrier(6, 2));
  report(kStart + 4, carrier(6, 0));  // deconfigured
  EXPECT_THAT(followed.texts(Kind::carrier),
              ElementsAre("Carrier added: PCI 5, EARFCN 700, band 2",
                          "Carrier removed: PCI 5, EARFCN 700, band 2",
                          "Carrier added: PCI 6, EARFCN 700, band 2",
                          "Carrier removed: PCI 6, EARFCN 700, band 2"));
}

}  // namespace
}  // namespace qel
