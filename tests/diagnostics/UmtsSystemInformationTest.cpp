// The rules of a UMTS cell, from its system information, whole and in segments.

#include <gtest/gtest.h>

#include "support/diagnostics/UmtsMessages.h"
#include "support/diagnostics/UmtsPackets.h"

namespace qel::diagnostics {
namespace {

using namespace test;  // NOLINT(google-build-using-namespace): of messages
using Metrics = std::vector<std::uint32_t>;

constexpr std::uint16_t kMessage = 0x412F;
constexpr std::uint16_t kCell = 0x4127;
constexpr std::uint32_t kCellInfo = 12300;
constexpr std::uint32_t kReselection = 53508;
constexpr std::uint32_t kConfiguration = 53523;
constexpr unsigned kBroadcast = 4;
constexpr std::uint64_t kBlockMs = 20;

Bytes whole(unsigned type, const BitWriter& block) {
  Bytes message{static_cast<std::uint8_t>(type)};
  const Bytes bits = block.bytes();
  message.insert(message.end(), bits.begin(), bits.end());
  return umtsRrc(9, message);
}

BitWriter longBlock() {
  return umtsBlock19(3, {{10663, 2}}, {{62, 1}, {1023, 1}, {512, 0}, {600, 0}, {700, 0}},
                     {{1300, 7}, {6400, 6}, {65535, 5}});
}
const std::string kLongBlock =
    R"({"multi_band_info": [], "s_cell_prio": 3, "eutra_prio_info": [{"earfcn": 1300, "prio": 7}, )"
    R"({"earfcn": 6400, "prio": 6}, {"earfcn": 65535, "prio": 5}], )"
    R"("utra_prio_info": [{"uarfcn": 10663, "prio": 2}], "gsm_prio_info": [)"
    R"({"arfcn": 62, "prio": 1}, {"arfcn": 1023, "prio": 1}, {"arfcn": 512, "prio": 0}, )"
    R"({"arfcn": 600, "prio": 0}, {"arfcn": 700, "prio": 0}]})";

TEST(UmtsBlock1, tellsTheShortestPagingCycleOfTheDomains) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kMessage, whole(1, umtsBlock1({7, 6}))), Metrics{kConfiguration});
  EXPECT_EQ(modem.said(kConfiguration), R"({"drx_cycle_length_ms": 640})");
  modem.send(kMessage, whole(1, umtsBlock1({9})));
  EXPECT_EQ(modem.said(kConfiguration), R"({"drx_cycle_length_ms": 5120})");
}

TEST(UmtsBlock3, tellsWhenAPhoneMustLookElsewhere) {
  UmtsModem modem;
  EXPECT_EQ(
      modem.send(kMessage,
                 whole(3, umtsBlock3({.intraSearch = 8, .interSearch = -16, .gsmSearch = 3}))),
      Metrics{kReselection});
  EXPECT_EQ(modem.said(kReselection),
            R"({"duplex_mode": "FDD", "multi_band_info": [], "cell_barred": 0, )"
            R"("s_intrasearch": 16, "s_intersearch": -32, "s_search_rat": 6})");
}

TEST(UmtsBlock3, tellsThatACellIsBarredAndLeavesOutWhatItDoesNotSay) {
  UmtsModem modem;
  modem.send(kMessage, whole(3, umtsBlock3({.barred = true})));
  EXPECT_EQ(modem.said(kReselection),
            R"({"duplex_mode": "FDD", "multi_band_info": [], "cell_barred": 1})");
}

TEST(UmtsBlock5, tellsOfHighSpeedAccess) {
  for (const bool downlink : {false, true}) {
    for (const bool uplink : {false, true}) {
      UmtsModem modem;
      EXPECT_EQ(modem.send(kMessage, whole(5, umtsBlock5(downlink, uplink))),
                Metrics{kReselection});
      EXPECT_EQ(modem.said(kReselection), R"({"hsdpa_capable": )" + std::to_string(downlink) +
                                              R"(, "edch_capable": )" + std::to_string(uplink) +
                                              R"(, "multi_band_info": []})");
    }
  }
}

TEST(UmtsBlock5, ofACellWithOneFrequencyIsNotRead) {
  UmtsModem modem;
  EXPECT_TRUE(modem.send(kMessage, whole(5, umtsBlock5(true, true, false))).empty());
  EXPECT_EQ(modem.said(kReselection), "");
}

TEST(UmtsBlock5, completesWhatIsKnownOfTheServingCell) {
  UmtsModem modem;
  modem.send(kMessage, whole(3, umtsBlock3()));
  modem.send(kCell, umtsCell());
  EXPECT_EQ(modem.said(kCellInfo).find("hspa"), std::string::npos);
  EXPECT_EQ(modem.send(kMessage, whole(5, umtsBlock5(true, true))),
            (Metrics{kReselection, kCellInfo}));
  EXPECT_NE(modem.said(kCellInfo).find(R"("hspa": "SYS_HS_IND_HSDPA_HSUPA_SUPP_CELL")"),
            std::string::npos);
  EXPECT_EQ(modem.send(kMessage, whole(5, umtsBlock5(true, true))), Metrics{kReselection});
}

TEST(UmtsBlock11, tellsWhetherThereAreOccasionsForMeasurements) {
  UmtsModem modem;
  modem.send(kMessage, whole(11, umtsBlock11(true)));
  EXPECT_EQ(modem.said(kReselection),
            R"({"multi_band_info": [], "fach_meas_occ_info_present": 1})");
  modem.send(kMessage, whole(11, umtsBlock11(false)));
  EXPECT_EQ(modem.said(kReselection),
            R"({"multi_band_info": [], "fach_meas_occ_info_present": 0})");
}

TEST(UmtsBlock19, tellsThePrioritiesOfFrequencies) {
  UmtsModem modem;
  EXPECT_EQ(modem.send(kMessage, whole(67, longBlock())), Metrics{kReselection});
  EXPECT_EQ(modem.said(kReselection), kLongBlock);
}

TEST(UmtsBlocks, thatTellNothingAreNotOurs) {
  UmtsModem modem;
  for (const unsigned type : {0U, 2U, 7U, 12U, 31U, 66U, 255U})
    EXPECT_TRUE(modem.send(kMessage, whole(type, umtsBlock3())).empty()) << type;
  EXPECT_EQ(modem.reader().counts().total().notOurs, 7U);
}

TEST(UmtsBlocks, stayWithTheCellThatTheyNameAndGoWithAnother) {
  UmtsModem modem;
  modem.send(kMessage, whole(1, umtsBlock1({7})));
  modem.send(kMessage, whole(3, umtsBlock3({.cellId = 77})));
  modem.send(kCell, umtsCell({.cellId = 77}));
  EXPECT_NE(modem.said(kReselection), "");
  EXPECT_NE(modem.said(kConfiguration), "");
  modem.send(kCell, umtsCell({.cellId = 78}));
  EXPECT_EQ(modem.said(kReselection), "");
  EXPECT_EQ(modem.said(kConfiguration), "");
}

TEST(UmtsBlocks, ofTheNextCellReplaceThoseThatWereReadLongBefore) {
  UmtsModem modem;
  modem.send(kMessage, whole(3, umtsBlock3({.cellId = 77})));
  modem.send(kMessage, whole(11, umtsBlock11(true)));
  modem.wait(5'001);
  modem.send(kMessage, whole(1, umtsBlock1({7})));
  modem.send(kMessage, whole(3, umtsBlock3({.cellId = 78})));
  EXPECT_EQ(modem.said(kReselection).find("fach_meas"), std::string::npos);
  EXPECT_NE(modem.said(kConfiguration), "");
}

// A block of two segments, the second so much later, by the frames and by the clock.
Metrics secondSegmentAfter(UmtsModem& modem, unsigned blocks, std::uint64_t milliseconds) {
  BitWriter filled = umtsBlock3();
  while (filled.size() < 300) filled.flag(false);
  modem.send(kMessage, umtsRrc(kBroadcast, umtsFirstSegment(2047, 3, 2, filled)));
  modem.wait(milliseconds);
  return modem.send(kMessage,
                    umtsRrc(kBroadcast, umtsLastSegment((2047 + blocks) % 2048, 3, 1, filled)));
}

TEST(UmtsSegments, makeABlockWhenTheyComeInOrder) {
  UmtsModem modem;
  EXPECT_EQ(secondSegmentAfter(modem, 1, kBlockMs), Metrics{kReselection});
  EXPECT_EQ(secondSegmentAfter(modem, 16, 16 * kBlockMs + 15), Metrics{kReselection});
}

TEST(UmtsSegments, makeNoneWhenTheyAreTooFarApartOrByAnotherClock) {
  UmtsModem modem;
  EXPECT_TRUE(secondSegmentAfter(modem, 17, 17 * kBlockMs).empty());
  EXPECT_TRUE(secondSegmentAfter(modem, 4, 4 * kBlockMs + 16).empty());
  EXPECT_TRUE(secondSegmentAfter(modem, 0, 0).empty());
  EXPECT_EQ(modem.damaged(), 0U);
}

TEST(UmtsSegments, ofOtherBlocksMayComeInBetween) {
  BitWriter filled = umtsBlock3();
  while (filled.size() < 300) filled.flag(false);
  UmtsModem modem;
  modem.send(kMessage, umtsRrc(kBroadcast, umtsFirstSegment(8, 3, 2, filled)));
  modem.wait(kBlockMs);
  EXPECT_EQ(modem.send(kMessage, umtsRrc(kBroadcast, umtsWholeBlock(9, 11, umtsBlock11(true)))),
            Metrics{kReselection});
  modem.wait(kBlockMs);
  EXPECT_EQ(modem.send(kMessage, umtsRrc(kBroadcast, umtsLastSegment(10, 3, 1, filled))),
            Metrics{kReselection});
}

TEST(UmtsSegments, outOfOrderMakeNone) {
  BitWriter filled = umtsBlock3();
  while (filled.size() < 2 * 222 + 100) filled.flag(false);
  const auto send = [&](UmtsModem& modem, const Bytes& message) {
    modem.wait(kBlockMs);
    return modem.send(kMessage, umtsRrc(kBroadcast, message));
  };
  UmtsModem good;
  send(good, umtsFirstSegment(1, 3, 3, filled));
  send(good, umtsNextSegment(2, 3, 1, filled));
  EXPECT_EQ(send(good, umtsLastSegment(3, 3, 2, filled)), Metrics{kReselection});
  UmtsModem lost;
  send(lost, umtsFirstSegment(1, 3, 3, filled));
  lost.wait(kBlockMs);
  EXPECT_TRUE(send(lost, umtsLastSegment(3, 3, 2, filled)).empty());
  UmtsModem twice;
  send(twice, umtsFirstSegment(1, 3, 3, filled));
  send(twice, umtsNextSegment(2, 3, 1, filled));
  send(twice, umtsNextSegment(3, 3, 1, filled));
  EXPECT_TRUE(send(twice, umtsLastSegment(4, 3, 2, filled)).empty());
  UmtsModem headless;
  EXPECT_TRUE(send(headless, umtsLastSegment(4, 3, 2, filled)).empty());
}

TEST(UmtsSegments, ofTwoCellsMakeNone) {
  BitWriter filled = umtsBlock3();
  while (filled.size() < 300) filled.flag(false);
  const BitWriter oneMaster = BitWriter().bits(1, 60);
  const BitWriter otherMaster = BitWriter().bits(2, 60);
  UmtsModem modem;
  const auto send = [&](const Bytes& message) {
    modem.wait(kBlockMs);
    return modem.send(kMessage, umtsRrc(kBroadcast, message));
  };
  send(umtsWholeBlock(4, 0, oneMaster));
  send(umtsFirstSegment(5, 3, 2, filled));
  send(umtsWholeBlock(6, 0, oneMaster));
  EXPECT_EQ(send(umtsLastSegment(7, 3, 1, filled)), Metrics{kReselection});
  send(umtsFirstSegment(8, 3, 2, filled));
  send(umtsWholeBlock(9, 0, otherMaster));
  EXPECT_TRUE(send(umtsLastSegment(10, 3, 1, filled)).empty());
}

}  // namespace
}  // namespace qel::diagnostics
