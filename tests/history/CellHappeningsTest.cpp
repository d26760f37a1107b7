#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "history/Followed.h"
#include "messages/gsm.h"
#include "messages/wcdma.h"

namespace qel {
namespace {

using ::testing::ElementsAre;
using testing::Followed;
using ::testing::IsEmpty;
using V = MetricValidator;
using Kind = HappeningKind;

constexpr std::uint64_t kStart = 1'500'000'000'000;

KCellularWcdmaCellInfo umtsCell(std::uint32_t cellId) {
  KCellularWcdmaCellInfo cell;
  cell.setCellId(cellId);
  return cell;
}

TEST(CellHappenings, tellTheFirstCellWithoutOneBefore) {
  Followed followed;
  followed.lteCell(kStart, 7);
  const auto cells = followed.happenings(Kind::cell);
  ASSERT_EQ(cells.size(), 1U);
  EXPECT_FALSE(cells[0].from);
  ASSERT_TRUE(cells[0].to);
  EXPECT_EQ(cells[0].to->code, 7U);
  EXPECT_EQ(cells[0].to->channel, 1300U);
  EXPECT_FALSE(cells[0].to->cellId);
  EXPECT_EQ(cells[0].to->mcc, "");
  EXPECT_EQ(cells[0].timeMs, kStart);
  EXPECT_EQ(cells[0].metric, V::K_LTE_SCELL_INFO);
  EXPECT_EQ(cells[0].technology, Technology::lte);
  EXPECT_EQ(cells[0].text, "On LTE PCI 7, EARFCN 1300");
}

TEST(CellHappenings, tellNothingOfAReportThatRepeatsTheCell) {
  Followed followed;
  followed.lteCell(kStart, 7);
  KCellularLteScellInfo again;
  again.setPhyCellId(7);
  again.setDlFreq(1300);
  again.setTrackingAreaCode(99);  // another area is no other cell
  followed.feed(kStart + 1, V::K_LTE_SCELL_INFO, again);
  EXPECT_EQ(followed.happenings(Kind::cell).size(), 1U);
  EXPECT_EQ(followed.history.servingCell(kStart + 1)->area, 99U);
  EXPECT_FALSE(followed.history.servingCell(kStart)->area);
}

TEST(CellHappenings, tellEveryChangeOfTechnologyChannelCodeOrIdentity) {
  Followed followed;
  followed.lteCell(kStart, 7);
  followed.lteCell(kStart + 1, 8);
  followed.lteCell(kStart + 2, 8, 1400);
  followed.feed(kStart + 3, V::K_UMTS_SCELL_INFO, umtsCell(5));
  followed.feed(kStart + 4, V::K_UMTS_SCELL_INFO, umtsCell(6));
  followed.lteCell(kStart + 5, 8, 1400);
  const auto cells = followed.happenings(Kind::cell);
  ASSERT_EQ(cells.size(), 6U);
  for (std::size_t i = 1; i < cells.size(); ++i) {
    EXPECT_TRUE(cells[i].from->isSameAs(*cells[i - 1].to)) << i;
    EXPECT_FALSE(cells[i].from->isSameAs(*cells[i].to)) << i;
  }
  EXPECT_EQ(cells[3].text, "From LTE PCI 8, EARFCN 1400 to UMTS cell 5");
}

TEST(CellHappenings, tellNothingOfAReportThatNamesNoCell) {
  Followed followed;
  followed.feed(kStart, V::K_LTE_SCELL_INFO, KCellularLteScellInfo());
  KCellularLteScellInfo areaAlone;
  areaAlone.setTrackingAreaCode(5);
  followed.feed(kStart, V::K_LTE_SCELL_INFO, areaAlone);
  EXPECT_TRUE(followed.history.happenings().empty());
  EXPECT_FALSE(followed.history.servingCell(kStart));
}

TEST(CellHappenings, writeNetworkCodesWithAllTheirDigits) {
  struct Case {
    std::uint32_t mcc, mnc;
    std::optional<std::uint32_t> digits;
    std::string mccText, mncText;
  };
  const std::vector<Case> cases = {
      {1, 1, 2U, "001", "01"},      {460, 0, 2U, "460", "00"}, {310, 4, 3U, "310", "004"},
      {310, 410, {}, "310", "410"}, {262, 2, {}, "262", "02"}, {262, 123, 2U, "262", "123"},
      {310, 41, 9U, "310", "041"},  {1000, 1000, 3U, "", ""},  {310, 10, {}, "310", "010"},
      {0, 0, 2U, "", ""},
  };
  for (const Case& one : cases) {
    Followed followed;
    KCellularGsmScellInfo cell;
    cell.setCellId(1);
    cell.setMcc(one.mcc);
    cell.setMnc(one.mnc);
    if (one.digits) cell.setNumMncDigits(*one.digits);
    followed.feed(kStart, V::K_GSM_SCELL_INFO, cell);
    const auto known = followed.history.servingCell(kStart);
    ASSERT_TRUE(known);
    EXPECT_EQ(known->mcc, one.mccText);
    EXPECT_EQ(known->mnc, one.mncText) << one.mnc;
  }
}

TEST(CellHappenings, knowOfTheCellThatWasLeftWhatAnyOfItsReportsTold) {
  Followed followed;
  followed.feed(kStart, V::K_UMTS_SCELL_INFO, umtsCell(5));
  KCellularWcdmaCellInfo more = umtsCell(5);
  more.setLac(12102);
  more.setMcc(208);
  more.setMnc(10);
  followed.feed(kStart + 1, V::K_UMTS_SCELL_INFO, more);
  followed.feed(kStart + 2, V::K_UMTS_SCELL_INFO, umtsCell(5));
  EXPECT_EQ(followed.history.servingCell(kStart + 2)->area, 12102U);
  followed.feed(kStart + 3, V::K_UMTS_SCELL_INFO, umtsCell(6));
  const auto cells = followed.happenings(Kind::cell);
  ASSERT_EQ(cells.size(), 2U);
  EXPECT_EQ(cells[1].from->area, 12102U);
  EXPECT_EQ(cells[1].from->mcc, "208");
  EXPECT_EQ(cells[1].from->mnc, "10");
  EXPECT_FALSE(cells[1].to->area) << "nobody told that of the new one";
  EXPECT_EQ(cells[1].to->mcc, "");
}

TEST(CellHappenings, keepTheTimeOfReceptionEvenWhereItGoesBack) {
  Followed followed;
  followed.lteCell(kStart, 7);
  followed.lteCell(kStart - 5000, 8);
  const auto cells = followed.happenings(Kind::cell);
  ASSERT_EQ(cells.size(), 2U);
  EXPECT_EQ(cells[1].timeMs, kStart - 5000);
  EXPECT_EQ(followed.history.happeningsUntil(kStart), 2U);
  EXPECT_EQ(followed.history.happeningsUntil(kStart - 1), 0U);
  EXPECT_EQ(followed.history.servingCell(kStart)->code, 8U);
}

TEST(CellHappenings, sayHowThePhoneCameToTheCell) {
  Followed followed;
  followed.lteCell(kStart, 1);
  followed.lteState(kStart + 1, 1);
  followed.lteCell(kStart + 2, 2);
  followed.lteState(kStart + 3, 3, 4);
  followed.lteCell(kStart + 4, 3);
  followed.lteState(kStart + 5, 2, 27);  // asks again: out of sync
  followed.lteState(kStart + 6, 3, 27);
  followed.lteCell(kStart + 7, 4);
  std::vector<CellMove> moves;
  for (const Happening& cell : followed.happenings(Kind::cell)) moves.push_back(cell.move);
  EXPECT_THAT(moves, ElementsAre(CellMove::unknown, CellMove::reselection, CellMove::handover,
                                 CellMove::unknown));
  EXPECT_EQ(followed.texts(Kind::cell).at(2),
            "Handover from LTE PCI 2, EARFCN 1300 to LTE PCI 3, EARFCN 1300");
}

TEST(TechnologyHappenings, tellAChangeAndNotTheFirstOne) {
  Followed followed;
  followed.lteCell(kStart, 1);
  EXPECT_THAT(followed.texts(Kind::technology), IsEmpty());
  followed.feed(kStart + 1, V::K_UMTS_SCELL_INFO, umtsCell(5));
  followed.feed(kStart + 2, V::K_UMTS_SCELL_INFO, umtsCell(6));
  followed.lteState(kStart + 3, 2);
  EXPECT_THAT(followed.texts(Kind::technology),
              ElementsAre("Changed from LTE to UMTS", "Changed from UMTS to LTE"));
  EXPECT_EQ(followed.history.technology(kStart), Technology::lte);
  EXPECT_EQ(followed.history.technology(kStart + 2), Technology::umts);
  EXPECT_EQ(followed.history.technology(kStart + 3), Technology::lte);
  EXPECT_FALSE(followed.history.servingCell(kStart + 3)) << "LTE has reported none";
  EXPECT_FALSE(followed.history.technology(kStart - 1));
}

TEST(TechnologyHappenings, takeALateEndOfAConnectionForNoChange) {
  Followed followed;
  followed.lteCell(kStart, 1);
  followed.feed(kStart + 1, V::K_UMTS_SCELL_INFO, umtsCell(5));
  followed.lteState(kStart + 2, 1);
  followed.lteState(kStart + 3, 0);
  EXPECT_EQ(followed.history.technology(kStart + 3), Technology::umts);
  EXPECT_EQ(followed.texts(Kind::technology).size(), 1U);
}

TEST(TechnologyHappenings, knowNoneFromAStateThatSaysNothing) {
  Followed followed;
  KCellularWcdmaRrcConnectionState state;
  state.setState(0);  // not known
  followed.feed(kStart, V::K_UMTS_RRC_STATE, state);
  EXPECT_FALSE(followed.history.technology(kStart));
  followed.lteState(kStart + 1, 1);
  EXPECT_EQ(followed.history.technology(kStart + 1), Technology::lte);
  EXPECT_THAT(followed.texts(Kind::technology), IsEmpty());
}

TEST(TechnologyHappenings, knowNoneOnceTheOneInUseWasLeft) {
  Followed followed;
  followed.lteCell(kStart, 1);
  followed.lteState(kStart + 1, 0);
  EXPECT_FALSE(followed.history.technology(kStart + 1));
  EXPECT_FALSE(followed.history.servingCell(kStart + 1));
  followed.lteCell(kStart + 2, 1);
  EXPECT_THAT(followed.texts(Kind::technology), IsEmpty());
  EXPECT_EQ(followed.happenings(Kind::cell).size(), 1U) << "it is the cell of before";
}

}  // namespace
}  // namespace qel
