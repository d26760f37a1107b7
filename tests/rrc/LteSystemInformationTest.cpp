// Whole messages of system information, written bit by bit.

#include "rrc/lte/Messages.h"

#include <gtest/gtest.h>

#include "rrc/BitWriter.h"

namespace qel::rrc::lte {
namespace {

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

TEST(LteSystemInformation, tellTheCell) {
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

TEST(LteSystemInformation, tellWhatLaterReleasesAddedToTheCell) {
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

TEST(LteSystemInformation, tellThatEmergencyCallsAreNotSupported) {
  const BitWriter release8 = BitWriter().bits(0b01, 2).bits(0b000, 3);
  const auto message = readLteMessage(LteChannel::bcchDlSch, sib1({.release8 = &release8}).bytes());
  ASSERT_TRUE(message && message->sib1);
  EXPECT_EQ(message->sib1->imsEmergencySupport, false);
}

TEST(LteSystemInformation, tellTheMasterInformationBlock) {
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

TEST(LteSystemInformation, tellTheRulesOfReselection) {
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

TEST(LteSystemInformation, preferTheThresholdsOfRelease9) {
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

TEST(LteSystemInformation, tellCarriersAndTheirWiderNumbers) {
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

TEST(LteSystemInformation, tellSeveralBlocksUpToTheFirstThatIsNotRead) {
  const BitWriter sib8 = BitWriter().flag(false).bits(6, 4);
  const auto message = readLteMessage(
      LteChannel::bcchDlSch,
      systemInformation(3).append(sib3(false)).append(sib8).bits(0xFFFF, 16).bytes());
  ASSERT_TRUE(message);
  EXPECT_TRUE(message->sib3);
  EXPECT_FALSE(message->sib5);
}

}  // namespace
}  // namespace qel::rrc::lte
