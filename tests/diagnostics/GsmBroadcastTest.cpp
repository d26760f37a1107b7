// What GSM cells broadcast, from the log to the metrics.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "messages/gsm.h"
#include "sources/Metrics.h"
#include "sources/diagnostics/gsm/RestOctets.h"
#include "support/diagnostics/GsmPackets.h"
#include "support/diagnostics/ReportChecks.h"

namespace qel::diagnostics {
namespace {

using test::Broadcast;
using test::Heart;
using test::PacketService;
using test::RadioChannel;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr std::uint16_t kLog = 0x512F;

Bytes type3(const Broadcast& cell) {
  return radioMessage(RadioChannel::broadcast, systemInformation3(cell), 18);
}

Bytes type4(const Broadcast& cell) {
  return radioMessage(RadioChannel::broadcast, systemInformation4(cell), fixedOctets4(cell));
}

Bytes type13(const PacketService& service) {
  return radioMessage(RadioChannel::broadcast, systemInformation13(service), 0);
}

KCellularGsmIdleConfig idleConfig(const Heart& heart) {
  return heart.report<KCellularGsmIdleConfig>(metric::kGsmIdleConfig);
}

KCellularGsmGprsConfig packetConfig(const Heart& heart) {
  return heart.report<KCellularGsmGprsConfig>(metric::kGsmGprsConfig);
}

TEST(GsmRestOctets, TellHighFromLowByThePadding) {
  const Bytes padding{0x2B, 0x2B};
  RestOctets low(padding);
  for (int i = 0; i < 20; ++i) EXPECT_FALSE(low.high()) << i;
  EXPECT_FALSE(low.failed());
  const Bytes inverted{0xD4};
  RestOctets high(inverted);
  for (int i = 0; i < 8; ++i) EXPECT_TRUE(high.high()) << i;
  EXPECT_FALSE(high.high());
}

TEST(GsmRestOctets, FailWhereANumberIsCutOff) {
  const Bytes octets{0xA5, 0x0F};
  RestOctets rest(octets);
  EXPECT_EQ(rest.bits(4), 0xAU);
  EXPECT_EQ(rest.bits(8), 0x50U);
  EXPECT_EQ(rest.bits(5), 0U);
  EXPECT_TRUE(rest.failed());
  EXPECT_EQ(rest.bits(1), 0U);
}

TEST(GsmBroadcast, TellsTheCellInType3) {
  Heart heart;
  EXPECT_THAT(heart.take(kLog, type3({})),
              ElementsAre(metric::kGsmScellInfo, metric::kGsmIdleConfig, metric::kGsmGprsConfig));
  const auto cell = heart.report<KCellularGsmScellInfo>(metric::kGsmScellInfo);
  EXPECT_EQ(cell.timestamp(), test::kSomeTimeMs);
  EXPECT_EQ(cell.mcc(), 1U);
  EXPECT_EQ(cell.mnc(), 1U);
  EXPECT_EQ(cell.numMncDigits(), 2U);
  EXPECT_EQ(cell.lac(), 0x1234U);
  EXPECT_EQ(cell.cellId(), 0xABCDU);
  EXPECT_FALSE(cell.hasArfcn());
  EXPECT_FALSE(cell.hasBsic());
  EXPECT_EQ(cell.state(), 2);
  EXPECT_EQ(heart.picture().technology, Technology::gsm);
}

TEST(GsmBroadcast, KeepsTheZerosOfNetworksWithThreeDigits) {
  Heart heart;
  Broadcast broadcast;
  broadcast.network = "310026";
  heart.take(kLog, type3(broadcast));
  const auto cell = heart.report<KCellularGsmScellInfo>(metric::kGsmScellInfo);
  EXPECT_EQ(cell.mcc(), 310U);
  EXPECT_EQ(cell.mnc(), 26U);
  EXPECT_EQ(cell.numMncDigits(), 3U);
}

TEST(GsmBroadcast, TellsTheRulesOfIdleModeInType3) {
  Heart heart;
  heart.take(kLog, type3({}));
  const auto config = idleConfig(heart);
  EXPECT_EQ(config.mcc(), 1U);
  EXPECT_EQ(config.mnc(), 1U);
  EXPECT_EQ(config.lac(), 0x1234U);
  EXPECT_EQ(config.ci(), 0xABCDU);
  EXPECT_EQ(config.attachAllowed(), 1U);
  EXPECT_EQ(config.bsPaMfrms(), 5U);
  EXPECT_EQ(config.t3212(), 20U);
  EXPECT_EQ(config.dtxFromBs(), 1U);
  EXPECT_EQ(config.radioLinkTimeout(), 24U);
  EXPECT_EQ(config.msTxpwr(), 7U);
  EXPECT_EQ(config.rxAccMin(), 9U);
  EXPECT_EQ(config.halfRateSupported(), 1U);
  EXPECT_EQ(config.maxRetransCs(), 4U);
  EXPECT_EQ(config.cba(), 0U);
  EXPECT_EQ(config.acc(), 0x0401U);
  EXPECT_EQ(config.emergCallAllowed(), 0U);
  EXPECT_EQ(config.reestAllowed(), 1U);
  EXPECT_EQ(config.c2Valid(), 1U);
  EXPECT_EQ(config.cbq(), 1U);
  EXPECT_EQ(config.tmpOffset(), 20U);
  EXPECT_EQ(config.penaltyT(), 100U);
  EXPECT_EQ(config.ecsc(), 1U);
  EXPECT_EQ(config.si2TerNeeded(), 1U);
  EXPECT_FALSE(config.hasCbchSupported());
  EXPECT_FALSE(config.hasSi78Broadcast());
  EXPECT_FALSE(config.hasMultibRep());
  EXPECT_FALSE(config.hasCsPagemode());
  EXPECT_FALSE(config.hasArfcnBcch());
}

TEST(GsmBroadcast, TellsTheOppositeAsWell) {
  Heart heart;
  Broadcast broadcast;
  broadcast.attach = broadcast.neci = broadcast.c2 = broadcast.si2ter = broadcast.ecsc = false;
  broadcast.barred = broadcast.noReestablishment = broadcast.powerOffset = true;
  broadcast.scheduling = true;
  broadcast.classes = 0;
  heart.take(kLog, type3(broadcast));
  const auto config = idleConfig(heart);
  EXPECT_EQ(config.attachAllowed(), 0U);
  EXPECT_EQ(config.halfRateSupported(), 0U);
  EXPECT_EQ(config.cba(), 1U);
  EXPECT_EQ(config.emergCallAllowed(), 1U);
  EXPECT_EQ(config.reestAllowed(), 0U);
  EXPECT_EQ(config.c2Valid(), 0U);
  EXPECT_FALSE(config.hasCbq());
  EXPECT_FALSE(config.hasTmpOffset());
  EXPECT_EQ(config.ecsc(), 0U);
  EXPECT_EQ(config.si2TerNeeded(), 0U);
  EXPECT_TRUE(packetConfig(heart).gprsSup());
}

TEST(GsmBroadcast, HasNoTemporaryOffsetWithoutLimit) {
  Heart heart;
  Broadcast broadcast;
  broadcast.temporary = 7;
  heart.take(kLog, type3(broadcast));
  EXPECT_FALSE(idleConfig(heart).hasTmpOffset());
  EXPECT_EQ(idleConfig(heart).penaltyT(), 100U);
  broadcast.temporary = 1;
  broadcast.penalty = 31;
  heart.take(kLog, type3(broadcast));
  EXPECT_FALSE(idleConfig(heart).hasTmpOffset());
  EXPECT_FALSE(idleConfig(heart).hasPenaltyT());
}

TEST(GsmBroadcast, TellsMoreInType4) {
  for (const bool cbch : {true, false}) {
    Heart heart;
    heart.take(kLog, type3({}));
    Broadcast broadcast;
    broadcast.cbch = cbch;
    EXPECT_THAT(heart.take(kLog, type4(broadcast)),
                ElementsAre(metric::kGsmIdleConfig, metric::kGsmGprsConfig));
    EXPECT_EQ(idleConfig(heart).cbchSupported(), cbch ? 1U : 0U);
    EXPECT_EQ(idleConfig(heart).si78Broadcast(), 0U);
    EXPECT_EQ(idleConfig(heart).tmpOffset(), 20U);
    EXPECT_EQ(idleConfig(heart).ci(), 0xABCDU);
  }
}

TEST(GsmBroadcast, LeavesTheRestOfType4ToTypes7And8WhereTheyAreSent) {
  Heart heart;
  Broadcast broadcast;
  broadcast.acs = true;
  heart.take(kLog, type4(broadcast));
  EXPECT_EQ(idleConfig(heart).si78Broadcast(), 1U);
  EXPECT_FALSE(idleConfig(heart).hasC2Valid());
  EXPECT_FALSE(heart.knows(metric::kGsmGprsConfig));
}

TEST(GsmBroadcast, ForgetsTheOldCellInANewArea) {
  Heart heart;
  heart.take(kLog, type3({}));
  Broadcast other;
  other.lac = 0x4321;
  heart.take(kLog, type4(other));
  EXPECT_FALSE(heart.knows(metric::kGsmScellInfo));
  EXPECT_FALSE(idleConfig(heart).hasT3212());
  EXPECT_EQ(idleConfig(heart).rxAccMin(), 9U);
}

TEST(GsmBroadcast, ForgetsWhatANewCellHasNotSaidYet) {
  Heart heart;
  heart.take(kLog, type3({}));
  heart.take(kLog, type4({}));
  heart.take(kLog, type13({}));
  Broadcast other;
  other.cellId = 7;
  heart.take(kLog, type3(other));
  EXPECT_FALSE(idleConfig(heart).hasCbchSupported());
  EXPECT_FALSE(packetConfig(heart).hasRac());
  EXPECT_EQ(idleConfig(heart).ci(), 7U);
}

TEST(GsmBroadcast, TellsThePacketServiceInType13) {
  for (const std::uint32_t allocation : {0U, 1U, 2U}) {
    for (const bool pan : {true, false}) {
      Heart heart;
      heart.take(kLog, type3({}));
      PacketService service;
      service.mobileAllocation = allocation;
      service.pan = pan;
      EXPECT_THAT(heart.take(kLog, type13(service)), ElementsAre(metric::kGsmGprsConfig));
      const auto config = packetConfig(heart);
      EXPECT_TRUE(config.gprsSup());
      EXPECT_EQ(config.rac(), 0x77U);
      EXPECT_TRUE(config.spPgCy());
      EXPECT_EQ(config.accThr(), 5U);
      EXPECT_EQ(config.nco(), 2U);
      EXPECT_EQ(config.nom(), 2U);
      EXPECT_EQ(config.crHyst(), 6U);
      EXPECT_TRUE(config.extUplTbfSupported());
      EXPECT_FALSE(config.hasPriorityClass());
    }
  }
}

TEST(GsmBroadcast, ReadsTheExtensionOfPacketOptionsAsFarAsItGoes) {
  PacketService service;
  service.edge = false;
  service.extendedUplink = false;
  Heart heart;
  heart.take(kLog, type13(service));
  EXPECT_TRUE(packetConfig(heart).hasExtUplTbfSupported());
  EXPECT_FALSE(packetConfig(heart).extUplTbfSupported());
  service.extension = false;
  heart.take(kLog, type13(service));
  EXPECT_FALSE(packetConfig(heart).hasExtUplTbfSupported());
}

TEST(GsmBroadcast, KnowsNoPacketRulesOfACellWithAPacketChannel) {
  PacketService service;
  service.packetChannel = true;
  Heart heart;
  EXPECT_THAT(heart.take(kLog, type13(service)), IsEmpty());
  EXPECT_FALSE(heart.knows(metric::kGsmGprsConfig));
}

TEST(GsmBroadcast, SaysWhereThereIsNoPacketService) {
  Broadcast broadcast;
  broadcast.gprs = false;
  Heart heart;
  heart.take(kLog, type3(broadcast));
  EXPECT_TRUE(packetConfig(heart).hasGprsSup());
  EXPECT_FALSE(packetConfig(heart).gprsSup());
}

TEST(GsmBroadcast, TellsHowManyCellsOfOtherBandsToReport) {
  Heart heart;
  heart.take(kLog, radioMessage(RadioChannel::broadcast, test::systemInformation2ter(2), 18));
  EXPECT_EQ(idleConfig(heart).multibRep(), 2U);
}

TEST(GsmBroadcast, TellsThePageModeWhenItChanges) {
  Heart heart;
  const auto paging = [&](std::uint8_t mode) {
    const Bytes message{0x06, 0x21, mode, 0x01, 0xF0};
    return heart.take(kLog, radioMessage(RadioChannel::common, message, 5));
  };
  EXPECT_THAT(paging(0), ElementsAre(metric::kGsmIdleConfig));
  EXPECT_THAT(paging(0), IsEmpty());
  EXPECT_THAT(paging(2), ElementsAre(metric::kGsmIdleConfig));
  EXPECT_EQ(idleConfig(heart).csPagemode(), 2U);
}

TEST(GsmBroadcast, ChangesNothingWhenDamaged) {
  Heart heart;
  heart.take(kLog, type3({}));
  const auto before = heart.payload(metric::kGsmIdleConfig);
  Broadcast other;
  other.cellId = 99;
  Bytes cut = systemInformation3(other);
  cut.resize(17);
  EXPECT_THAT(heart.take(kLog, radioMessage(RadioChannel::broadcast, cut, 18)), IsEmpty());
  other.network = "0010;";  // no digit: 11
  EXPECT_THAT(heart.take(kLog, type3(other)), IsEmpty());
  EXPECT_EQ(heart.payload(metric::kGsmIdleConfig), before);
  EXPECT_EQ(heart.counts().damaged, 2U);
}

TEST(GsmBroadcast, IsReadOnlyFromItsOwnChannel) {
  Heart heart;
  heart.take(kLog, radioMessage(RadioChannel::common, test::systemInformation3({}), 18));
  EXPECT_FALSE(heart.knows(metric::kGsmScellInfo));
}

TEST(GsmBroadcast, StandsEveryDamage) {
  PacketService service;
  service.mobileAllocation = 2;
  for (const Bytes& log : {type3({}), type4({}), type13({}), type13(service)}) {
    test::mistreat(kLog, log,
                   {metric::kGsmScellInfo, metric::kGsmIdleConfig, metric::kGsmGprsConfig});
  }
}

}  // namespace
}  // namespace qel::diagnostics
