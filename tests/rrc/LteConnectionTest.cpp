// Whole messages about a connection, written bit by bit.

#include "rrc/lte/Messages.h"

#include <gtest/gtest.h>

#include "rrc/BitWriter.h"

namespace qel::rrc::lte {
namespace {

using testing::BitWriter;

TEST(LteConnectionMessages, tellWhyAConnectionIsAskedFor) {
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

TEST(LteConnectionMessages, tellWhyAConnectionIsAskedForAgain) {
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

TEST(LteConnectionMessages, tellWhyAConnectionEndsAndWhereToGo) {
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

TEST(LteConnectionMessages, tellARedirectionToNr) {
  const BitWriter nr = BitWriter().flag(false).number(632448, 0, 3279165).bits(1, 2);
  const auto message = readLteMessage(
      LteChannel::dlDcch, release(true).bits(1, 2).flag(true).smallNumber(1).contained(nr).bytes());
  ASSERT_TRUE(message && message->release && message->release->redirection);
  EXPECT_EQ(message->release->redirection->target, Target::nr);
  EXPECT_EQ(message->release->redirection->carrier, 632448U);
}

TEST(LteConnectionMessages, tellWhereAHandoverOutOfLteGoes) {
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

TEST(LteConnectionMessages, handOutWhatTheyCarryForTheLayerAbove) {
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

TEST(LteConnectionMessages, tellWhatWasMeasured) {
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

TEST(LteConnectionMessages, tellDiscontinuousReception) {
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

TEST(LteConnectionMessages, tellThatReceptionIsContinuousAgain) {
  const auto message =
      readLteMessage(LteChannel::dlCcch, setupWithDrx(BitWriter().flag(false), false).bytes());
  ASSERT_TRUE(message && message->radio && message->radio->drx);
  EXPECT_FALSE(message->radio->drx->setup);
}

TEST(LteConnectionMessages, preferTheTimersOfLaterReleases) {
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

TEST(LteConnectionMessages, tellSecondaryCells) {
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

TEST(LteConnectionMessages, tellWhichCarrierIsMeasuredUnderWhichIdentity) {
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

TEST(LteConnectionMessages, ofKindsThatAreNotReadAreNamed) {
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

TEST(LteConnectionMessages, areNothingWhenThereAreNoBits) {
  for (unsigned channel = 0; channel < 8; ++channel) {
    EXPECT_FALSE(readLteMessage(static_cast<LteChannel>(channel), {}));
  }
  EXPECT_FALSE(readLteMessage(static_cast<LteChannel>(8), Bytes(100)));
}

}  // namespace
}  // namespace qel::rrc::lte
