// Whole messages, written bit by bit.

#include "rrc/lte/Messages.h"

#include <gtest/gtest.h>

#include "rrc/BitWriter.h"

namespace qel::rrc {
namespace {

using namespace lte;
using testing::BitWriter;

BitWriter plmn(std::initializer_list<unsigned> mcc, std::initializer_list<unsigned> mnc,
               bool reserved) {
  BitWriter bits;
  bits.flag(mcc.size() > 0);
  for (const unsigned digit : mcc) bits.bits(digit, 4);
  bits.number(static_cast<std::int64_t>(mnc.size()), 2, 3);
  for (const unsigned digit : mnc) bits.bits(digit, 4);
  return bits.flag(!reserved);
}

struct Sib1Choice {
  bool tdd = false;
  const BitWriter* release8 = nullptr;  // what stands behind, from the first extension on
};

BitWriter sib1(const Sib1Choice& choice) {
  BitWriter bits;
  bits.bits(0b01, 2);                                        // c1: SIB1
  bits.bits(0b1, 1).flag(choice.tdd).flag(choice.release8);  // p-Max, tdd-Config, extension
  bits.flag(false);                                          // no CSG
  bits.number(2, 1, 6).append(plmn({3, 1, 0}, {2, 6, 0}, false)).append(plmn({}, {4, 4}, true));
  bits.bits(0xABCD, 16).bits(0x1234567, 28);
  bits.bits(1, 1).bits(0, 1).flag(false);  // not barred, reselection allowed, open to all
  bits.flag(true).number(-64, -70, -22).number(3, 1, 8);
  bits.number(23, -30, 33).number(64, 1, 64);
  bits.number(1, 1, 32).bits(2, 3).number(0, 0, 31);  // one block each 320 ms, none in it
  if (choice.tdd) bits.bits(2, 3).bits(7, 4);
  bits.bits(3, 3).bits(17, 5);  // window, tag
  if (choice.release8) bits.append(*choice.release8);
  return bits;
}

TEST(LteMessages, tellTheCell) {
  const auto message = readLteMessage(LteChannel::bcchDlSch, sib1({}).bytes());
  ASSERT_TRUE(message);
  EXPECT_EQ(message->kind, Kind::systemInformationBlockType1);
  ASSERT_TRUE(message->sib1);
  const Sib1& sib = *message->sib1;
  ASSERT_EQ(sib.plmns.size(), 2U);
  EXPECT_EQ(sib.plmns[0].mcc, 310U);
  EXPECT_EQ(sib.plmns[0].mnc, 260U);
  EXPECT_EQ(sib.plmns[0].mncDigits, 3U);
  EXPECT_FALSE(sib.plmns[0].reservedForOperator);
  EXPECT_EQ(sib.plmns[1].mcc, 310U) << "that of the one before";
  EXPECT_EQ(sib.plmns[1].mnc, 44U);
  EXPECT_EQ(sib.plmns[1].mncDigits, 2U);
  EXPECT_TRUE(sib.plmns[1].reservedForOperator);
  EXPECT_EQ(sib.trackingAreaCode, 0xABCDU);
  EXPECT_EQ(sib.cellIdentity, 0x1234567U);
  EXPECT_FALSE(sib.barred);
  EXPECT_TRUE(sib.intraFrequencyReselection);
  EXPECT_EQ(sib.qRxLevMin, -64);
  EXPECT_EQ(sib.qRxLevMinOffset, 3U);
  EXPECT_EQ(sib.pMaxDbm, 23);
  EXPECT_EQ(sib.band, 64U);
  EXPECT_TRUE(sib.furtherBands.empty());
  EXPECT_FALSE(sib.tdd);
  EXPECT_EQ(sib.qQualMinDb, std::nullopt);
  EXPECT_EQ(sib.imsEmergencySupport, std::nullopt) << "release 8 knows nothing of it";
}

TEST(LteMessages, tellWhatLaterReleasesAddedToTheCell) {
  const BitWriter wider = BitWriter()
                              .bits(0b110, 3)  // band and list; nothing behind
                              .number(66, 65, 256)
                              .number(2, 1, 8)
                              .flag(false)
                              .flag(true)
                              .number(71, 65, 256);
  const BitWriter bands =
      BitWriter().bits(0b11, 2).number(2, 1, 8).number(4, 1, 64).number(64, 1, 64).append(wider);
  BitWriter release8;
  release8.bits(0b11, 2).contained(bands);
  release8.bits(0b111, 3);  // IMS emergency calls, quality, more
  release8.bits(0b1, 1).number(-18, -34, -3).number(2, 1, 8);
  release8.bits(0b100, 3).bits(1, 1);  // TDD pattern 9
  const auto message =
      readLteMessage(LteChannel::bcchDlSch, sib1({.tdd = true, .release8 = &release8}).bytes());
  ASSERT_TRUE(message && message->sib1);
  const Sib1& sib = *message->sib1;
  EXPECT_EQ(sib.band, 66U);
  EXPECT_EQ(sib.furtherBands, (std::vector<unsigned>{4, 71}));
  EXPECT_EQ(sib.qQualMinDb, -18);
  EXPECT_EQ(sib.qQualMinOffsetDb, 2U);
  EXPECT_EQ(sib.imsEmergencySupport, true);
  ASSERT_TRUE(sib.tdd);
  EXPECT_EQ(sib.tdd->subframeAssignment, 2U);
  EXPECT_EQ(sib.tdd->specialSubframePattern, 9U);
}

TEST(LteMessages, tellThatEmergencyCallsAreNotSupported) {
  const BitWriter release8 = BitWriter().bits(0b01, 2).bits(0b000, 3);
  const auto message = readLteMessage(LteChannel::bcchDlSch, sib1({.release8 = &release8}).bytes());
  ASSERT_TRUE(message && message->sib1);
  EXPECT_EQ(message->sib1->imsEmergencySupport, false);
}

TEST(LteMessages, tellTheMasterInformationBlock) {
  const auto message =
      readLteMessage(LteChannel::bcchBch, BitWriter().bits(3, 3).bits(0, 3).bits(0xA5, 8).bytes());
  ASSERT_TRUE(message);
  EXPECT_EQ(message->kind, Kind::masterInformationBlock);
  ASSERT_TRUE(message->mib);
  EXPECT_EQ(message->mib->dlBandwidthBlocks, 50U);
  EXPECT_EQ(message->mib->sfnHigh, 0xA5U);
}

BitWriter systemInformation(unsigned blocks) {
  return BitWriter().bits(0b00, 2).flag(false).flag(false).number(blocks, 1, 32);
}

BitWriter sib3(bool extended) {
  BitWriter bits;
  bits.flag(false).bits(1, 4).flag(extended);        // SIB3
  bits.flag(false).bits(7, 4);                       // q-Hyst 8 dB
  bits.flag(true).bits(6, 5).bits(2, 5).bits(5, 3);  // non-intra, low, priority
  bits.bits(0b1110, 4).number(-60, -70, -22).number(23, -30, 33).bits(31, 5).bits(3, 3);
  bits.flag(true).bits(2, 2).bits(1, 3);  // antenna port, neighbours, T
  return bits;
}

TEST(LteMessages, tellTheRulesOfReselection) {
  const auto message =
      readLteMessage(LteChannel::bcchDlSch, systemInformation(1).append(sib3(false)).bytes());
  ASSERT_TRUE(message && message->sib3);
  EXPECT_EQ(message->kind, Kind::systemInformation);
  const Sib3& sib = *message->sib3;
  EXPECT_EQ(sib.qHystDb, 8U);
  EXPECT_EQ(sib.sNonIntraSearch, 6U);
  EXPECT_EQ(sib.threshServingLow, 2U);
  EXPECT_EQ(sib.priority, 5U);
  EXPECT_EQ(sib.qRxLevMin, -60);
  EXPECT_EQ(sib.pMaxDbm, 23);
  EXPECT_EQ(sib.sIntraSearch, 31U);
  EXPECT_EQ(sib.measuredBandwidthBlocks, 50U);
  EXPECT_EQ(sib.tReselectionS, 1U);
  EXPECT_EQ(sib.sIntraSearchQDb, std::nullopt);
  EXPECT_EQ(sib.qQualMinDb, std::nullopt);
}

TEST(LteMessages, preferTheThresholdsOfRelease9) {
  const BitWriter group = BitWriter()
                              .bits(0b1111, 4)
                              .bits(20, 5)
                              .bits(5, 5)
                              .bits(10, 5)
                              .bits(4, 5)
                              .number(-19, -34, -3)
                              .bits(3, 5);
  const auto message = readLteMessage(LteChannel::bcchDlSch, systemInformation(1)
                                                                 .append(sib3(true))
                                                                 .smallNumber(1)
                                                                 .bits(0b01, 2)
                                                                 .contained(group)
                                                                 .bytes());
  ASSERT_TRUE(message && message->sib3);
  const Sib3& sib = *message->sib3;
  EXPECT_EQ(sib.sIntraSearch, 20U);
  EXPECT_EQ(sib.sIntraSearchQDb, 5U);
  EXPECT_EQ(sib.sNonIntraSearch, 10U);
  EXPECT_EQ(sib.sNonIntraSearchQDb, 4U);
  EXPECT_EQ(sib.qQualMinDb, -19);
  EXPECT_EQ(sib.threshServingLowQDb, 3U);
}

BitWriter interFrequency(unsigned earfcn, bool offset) {
  BitWriter bits;
  bits.flag(false).bits(0b001, 3).flag(offset).bits(0b00, 2);  // priority; offset
  bits.bits(earfcn, 16).number(-65, -70, -22).bits(2, 3).bits(7, 5).bits(3, 5);
  bits.bits(4, 3).flag(false).bits(6, 3).bits(0, 2);
  if (offset) bits.number(3, 0, 30);
  return bits;
}

TEST(LteMessages, tellCarriersAndTheirWiderNumbers) {
  const BitWriter numbers = BitWriter()
                                .bits(0b10, 2)
                                .number(2, 1, 8)
                                .bits(0b10, 2)
                                .number(66486, 65536, 262143)
                                .bits(0b00, 2);
  const BitWriter late = BitWriter().bits(0b01, 2).append(numbers);
  const auto message =
      readLteMessage(LteChannel::bcchDlSch, systemInformation(1)
                                                .flag(false)
                                                .bits(3, 4)
                                                .flag(true)
                                                .number(2, 1, 8)
                                                .append(interFrequency(65535, true))
                                                .append(interFrequency(1300, false))
                                                .smallNumber(0)
                                                .flag(true)
                                                .contained(BitWriter().contained(late))
                                                .bytes());
  ASSERT_TRUE(message && message->sib5);
  const auto& carriers = message->sib5->carriers;
  ASSERT_EQ(carriers.size(), 2U);
  EXPECT_EQ(carriers[0].earfcn, 66486U);
  EXPECT_EQ(carriers[0].qOffsetDb, -18);
  EXPECT_EQ(carriers[1].earfcn, 1300U);
  EXPECT_EQ(carriers[1].qOffsetDb, 0) << "what it is when nothing is said";
  EXPECT_EQ(carriers[1].qRxLevMin, -65);
  EXPECT_EQ(carriers[1].tReselectionS, 2U);
  EXPECT_EQ(carriers[1].threshXHigh, 7U);
  EXPECT_EQ(carriers[1].threshXLow, 3U);
  EXPECT_EQ(carriers[1].measuredBandwidthBlocks, 75U);
  EXPECT_EQ(carriers[1].priority, 6U);
  EXPECT_EQ(carriers[1].pMaxDbm, std::nullopt);
}

TEST(LteMessages, tellSeveralBlocksUpToTheFirstThatIsNotRead) {
  const BitWriter sib8 = BitWriter().flag(false).bits(6, 4);
  const auto message = readLteMessage(
      LteChannel::bcchDlSch,
      systemInformation(3).append(sib3(false)).append(sib8).bits(0xFFFF, 16).bytes());
  ASSERT_TRUE(message);
  EXPECT_TRUE(message->sib3);
  EXPECT_FALSE(message->sib5);
}

TEST(LteMessages, tellWhyAConnectionIsAskedFor) {
  for (unsigned cause = 0; cause < 8; ++cause) {
    const auto message = readLteMessage(LteChannel::ulCcch, BitWriter()
                                                                .bits(0b01, 2)
                                                                .flag(false)
                                                                .flag(true)
                                                                .bits(0x123456789A, 40)
                                                                .bits(cause, 3)
                                                                .flag(false)
                                                                .bytes());
    ASSERT_TRUE(message && message->request);
    EXPECT_EQ(message->kind, Kind::rrcConnectionRequest);
    EXPECT_EQ(message->request->cause, static_cast<EstablishmentCause>(cause));
  }
}

TEST(LteMessages, tellWhyAConnectionIsAskedForAgain) {
  const auto message = readLteMessage(LteChannel::ulCcch, BitWriter()
                                                              .bits(0b00, 2)
                                                              .flag(false)
                                                              .bits(0x1234, 16)
                                                              .number(301, 0, 503)
                                                              .bits(0x5678, 16)
                                                              .bits(1, 2)
                                                              .bits(0, 2)
                                                              .bytes());
  ASSERT_TRUE(message && message->reestablishmentRequest);
  EXPECT_EQ(message->reestablishmentRequest->pci, 301U);
  EXPECT_EQ(message->reestablishmentRequest->cause, ReestablishmentCause::handoverFailure);
}

BitWriter release(bool redirected) {
  return BitWriter().bits(0b00101, 5).bits(1, 2).bits(0b000, 3).flag(redirected).bits(0b00, 2);
}

TEST(LteMessages, tellWhyAConnectionEndsAndWhereToGo) {
  const auto plain = readLteMessage(LteChannel::dlDcch, release(false).bits(2, 2).bytes());
  ASSERT_TRUE(plain && plain->release);
  EXPECT_EQ(plain->release->cause, ReleaseCause::csFallbackHighPriority);
  EXPECT_FALSE(plain->release->redirection);

  const auto redirected = readLteMessage(
      LteChannel::dlDcch, release(true).bits(1, 2).flag(false).bits(2, 3).bits(10700, 14).bytes());
  ASSERT_TRUE(redirected && redirected->release && redirected->release->redirection);
  EXPECT_EQ(redirected->release->redirection->target, Target::utraFdd);
  EXPECT_EQ(redirected->release->redirection->carrier, 10700U);
}

TEST(LteMessages, tellARedirectionToNr) {
  const BitWriter nr = BitWriter().flag(false).number(632448, 0, 3279165).bits(1, 2);
  const auto message = readLteMessage(
      LteChannel::dlDcch, release(true).bits(1, 2).flag(true).smallNumber(1).contained(nr).bytes());
  ASSERT_TRUE(message && message->release && message->release->redirection);
  EXPECT_EQ(message->release->redirection->target, Target::nr);
  EXPECT_EQ(message->release->redirection->carrier, 632448U);
}

TEST(LteMessages, tellWhereAHandoverOutOfLteGoes) {
  for (const auto& [place, target] : {std::pair{0U, Target::utra}, std::pair{1U, Target::geran}}) {
    const auto message = readLteMessage(LteChannel::dlDcch, BitWriter()
                                                                .bits(0b00011, 5)
                                                                .bits(0, 2)
                                                                .bits(0b0000, 4)
                                                                .flag(false)
                                                                .flag(false)
                                                                .bits(0b00, 2)
                                                                .flag(false)
                                                                .bits(place, 3)
                                                                .contained(BitWriter().bits(0, 16))
                                                                .bytes());
    ASSERT_TRUE(message && message->mobility);
    EXPECT_EQ(message->mobility->target, target);
  }
}

TEST(LteMessages, handOutWhatTheyCarryForTheLayerAbove) {
  const Bytes nas = {0x07, 0x41, 0x71};
  const auto down = readLteMessage(LteChannel::dlDcch, BitWriter()
                                                           .bits(0b00001, 5)
                                                           .bits(0, 2)
                                                           .bits(0b000, 3)
                                                           .flag(false)
                                                           .bits(0, 2)
                                                           .length(nas.size())
                                                           .octets(nas)
                                                           .bytes());
  ASSERT_TRUE(down);
  EXPECT_EQ(down->kind, Kind::dlInformationTransfer);
  EXPECT_EQ(down->nas, std::vector<Bytes>{nas});

  const auto complete = readLteMessage(LteChannel::ulDcch, BitWriter()
                                                               .bits(0b00100, 5)
                                                               .bits(2, 2)
                                                               .bits(0b000, 3)
                                                               .bits(0b00, 2)
                                                               .number(1, 1, 6)
                                                               .length(nas.size())
                                                               .octets(nas)
                                                               .bytes());
  ASSERT_TRUE(complete);
  EXPECT_EQ(complete->kind, Kind::rrcConnectionSetupComplete);
  EXPECT_EQ(complete->nas, std::vector<Bytes>{nas});
}

TEST(LteMessages, tellWhatWasMeasured) {
  BitWriter bits;
  bits.bits(0b00001, 5).bits(0b0000, 4).flag(false);  // report of release 8, nothing behind
  bits.flag(false).flag(true).number(5, 1, 32).bits(60, 7).bits(20, 6);
  bits.flag(false).bits(0, 2).number(2, 1, 8);
  bits.flag(false).number(301, 0, 503).flag(false).bits(0b11, 2).bits(55, 7).bits(15, 6);
  bits.flag(false).number(12, 0, 503).flag(false).bits(0b10, 2).bits(40, 7);
  const auto message = readLteMessage(LteChannel::ulDcch, bits.bytes());
  ASSERT_TRUE(message && message->report);
  EXPECT_EQ(message->report->id, 5U);
  EXPECT_EQ(message->report->rsrp, 60U);
  EXPECT_EQ(message->report->rsrq, 20U);
  ASSERT_EQ(message->report->eutra.size(), 2U);
  EXPECT_EQ(message->report->eutra[0].pci, 301U);
  EXPECT_EQ(message->report->eutra[0].rsrp, 55U);
  EXPECT_EQ(message->report->eutra[0].rsrq, 15U);
  EXPECT_EQ(message->report->eutra[1].pci, 12U);
  EXPECT_EQ(message->report->eutra[1].rsrp, 40U);
  EXPECT_EQ(message->report->eutra[1].rsrq, std::nullopt);
}

// A setup of which only the discontinuous reception matters. `added`: groups of additions.
BitWriter setupWithDrx(const BitWriter& drx, bool extended) {
  BitWriter bits;
  bits.bits(0b011, 3).bits(1, 2).bits(0b0000, 4).flag(false);  // setup of release 8
  bits.flag(false).bits(0b000100, 6);                          // only mac-MainConfig
  bits.flag(false).flag(extended).bits(0b010, 3).append(drx).bits(7, 3);
  return bits;
}

BitWriter drxSetup() {
  return BitWriter()
      .flag(true)
      .flag(true)
      .bits(7, 4)   // 10 ms awake
      .bits(14, 5)  // 100 ms after data
      .bits(4, 3)   // 8 ms for a retransmission
      .bits(9, 4)
      .number(123, 0, 319)
      .bits(9, 4)  // short cycle of 80 ms
      .number(1, 1, 16);
}

TEST(LteMessages, tellDiscontinuousReception) {
  const auto message = readLteMessage(LteChannel::dlCcch, setupWithDrx(drxSetup(), false).bytes());
  ASSERT_TRUE(message && message->radio && message->radio->drx && message->radio->drx->setup);
  EXPECT_EQ(message->kind, Kind::rrcConnectionSetup);
  const Drx& drx = *message->radio->drx->setup;
  EXPECT_EQ(drx.onDurationMs, 10U);
  EXPECT_EQ(drx.inactivityMs, 100U);
  EXPECT_EQ(drx.retransmissionMs, 8U);
  EXPECT_EQ(drx.longCycleMs, 320U);
  EXPECT_EQ(drx.startOffsetMs, 123U);
  EXPECT_EQ(drx.shortCycleMs, 80U);
  EXPECT_EQ(drx.shortCycles, 1U);
}

TEST(LteMessages, tellThatReceptionIsContinuousAgain) {
  const auto message =
      readLteMessage(LteChannel::dlCcch, setupWithDrx(BitWriter().flag(false), false).bytes());
  ASSERT_TRUE(message && message->radio && message->radio->drx);
  EXPECT_FALSE(message->radio->drx->setup);
}

TEST(LteMessages, preferTheTimersOfLaterReleases) {
  const BitWriter release11 =
      BitWriter().bits(0b001, 3).bits(0b111, 3).flag(true).number(65, 0, 69);
  const BitWriter release13 =
      BitWriter().flag(true).flag(true).bits(0b110, 3).bits(2, 3).bits(7, 3);
  const auto message = readLteMessage(LteChannel::dlCcch, setupWithDrx(drxSetup(), true)
                                                              .smallNumber(5)
                                                              .bits(0b001001, 6)
                                                              .contained(release11)
                                                              .contained(release13)
                                                              .bytes());
  ASSERT_TRUE(message && message->radio && message->radio->drx && message->radio->drx->setup);
  const Drx& drx = *message->radio->drx->setup;
  EXPECT_EQ(drx.onDurationMs, 500U);
  EXPECT_EQ(drx.retransmissionMs, 320U);
  EXPECT_EQ(drx.longCycleMs, 70U);
  EXPECT_EQ(drx.startOffsetMs, 65U);
  EXPECT_EQ(drx.shortCycleMs, 4U);
  EXPECT_EQ(drx.inactivityMs, 100U);
}

// A reconfiguration whose optional parts are told by `present`, in the standard's order.
BitWriter reconfiguration(unsigned present) {
  return BitWriter().bits(0b00100, 5).bits(0, 2).bits(0b0000, 4).bits(present, 6);
}

TEST(LteMessages, tellSecondaryCells) {
  BitWriter cell;
  cell.flag(true).bits(0b100, 3).number(2, 1, 7);  // with additions; only where it is
  cell.number(77, 0, 503).bits(65535, 16);
  cell.smallNumber(0).flag(true).contained(BitWriter().flag(true).number(66786, 65536, 262143));
  BitWriter bits = reconfiguration(0b000001);
  bits.bits(0b01, 2).bits(0b001, 3);  // release 8, release 9: only on to 10
  bits.bits(0b110, 3).number(2, 1, 4).number(1, 1, 7).number(3, 1, 7);
  bits.number(1, 1, 4).append(cell);
  const auto message = readLteMessage(LteChannel::dlDcch, bits.bytes());
  ASSERT_TRUE(message && message->reconfiguration);
  EXPECT_EQ(message->reconfiguration->removedSecondaryCells, (std::vector<unsigned>{1, 3}));
  ASSERT_EQ(message->reconfiguration->secondaryCells.size(), 1U);
  const SecondaryCell& added = message->reconfiguration->secondaryCells[0];
  EXPECT_EQ(added.index, 2U);
  EXPECT_EQ(added.pci, 77U);
  EXPECT_EQ(added.dlEarfcn, 66786U);
  EXPECT_FALSE(added.uplink);
  EXPECT_EQ(added.dlBandwidthBlocks, std::nullopt);
}

TEST(LteMessages, tellWhichCarrierIsMeasuredUnderWhichIdentity) {
  BitWriter object;
  object.number(3, 1, 32).flag(false).bits(0, 2);  // LTE
  object.flag(false).bits(0b000000, 6).bits(1300, 16).bits(5, 3).flag(false).bits(0, 2);
  BitWriter measurements;
  measurements.flag(false).bits(0b01000100000, 11);
  measurements.number(1, 1, 32).append(object);
  measurements.number(1, 1, 32).number(9, 1, 32).number(3, 1, 32).number(1, 1, 32);
  const auto message =
      readLteMessage(LteChannel::dlDcch, reconfiguration(0b100000).append(measurements).bytes());
  ASSERT_TRUE(message && message->reconfiguration && message->reconfiguration->measurements);
  const MeasurementConfiguration& configuration = *message->reconfiguration->measurements;
  ASSERT_EQ(configuration.objects.size(), 1U);
  EXPECT_EQ(configuration.objects[0].id, 3U);
  EXPECT_EQ(configuration.objects[0].technology, Target::eutra);
  EXPECT_EQ(configuration.objects[0].carrier, 1300U);
  ASSERT_EQ(configuration.identities.size(), 1U);
  EXPECT_EQ(configuration.identities[0].id, 9U);
  EXPECT_EQ(configuration.identities[0].object, 3U);
}

TEST(LteMessages, ofKindsThatAreNotReadAreNamed) {
  const auto security =
      readLteMessage(LteChannel::dlDcch, BitWriter().bits(0b00110, 5).bits(0, 11).bytes());
  ASSERT_TRUE(security);
  EXPECT_EQ(security->kind, Kind::securityModeCommand);
  EXPECT_FALSE(security->radio);
  const auto paging = readLteMessage(LteChannel::pcch, BitWriter().bits(0, 16).bytes());
  ASSERT_TRUE(paging);
  EXPECT_EQ(paging->kind, Kind::paging);
  const auto newer = readLteMessage(LteChannel::dlDcch, Bytes{0x80});
  ASSERT_TRUE(newer);
  EXPECT_EQ(newer->kind, Kind::other);
}

TEST(LteMessages, areNothingWhenThereAreNoBits) {
  for (unsigned channel = 0; channel < 8; ++channel) {
    EXPECT_FALSE(readLteMessage(static_cast<LteChannel>(channel), {}));
  }
  EXPECT_FALSE(readLteMessage(static_cast<LteChannel>(8), Bytes(100)));
}

}  // namespace
}  // namespace qel::rrc
