#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "history/Followed.h"
#include "messages/gsm.h"
#include "messages/lte_neighbours.h"

namespace qel {
namespace {

using ::testing::ElementsAre;
using testing::Followed;
using ::testing::IsEmpty;
using V = MetricValidator;

constexpr std::uint64_t kStart = 1'500'000'000'000;

void report(Followed& followed, std::uint64_t timeMs,
            std::initializer_list<std::pair<std::uint32_t, std::int32_t>> cells,
            std::uint32_t earfcn = 1300) {
  KCellularLteNbrEutraCellMeas message;
  for (const auto& [pci, rsrp] : cells) {
    auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
    cell->setNbrEarfcn(earfcn);
    cell->setNbrPhysCellId(pci);
    cell->setNbrRsrp(rsrp);
    message.addMeasNbrEutra(cell);
  }
  followed.feed(timeMs, V::K_LTE_INTRARAT_MEAS, message);
}

std::vector<std::uint32_t> codes(const Followed& followed, std::uint64_t atMs) {
  std::vector<std::uint32_t> found;
  for (const Neighbour& cell : followed.history.neighbours(atMs)) {
    found.push_back(cell.code.value_or(9999));
  }
  return found;
}

TEST(Neighbours, comeStrongestFirst) {
  Followed followed;
  followed.lteCell(kStart, 1);
  report(followed, kStart + 1, {{5, 30}, {6, 50}, {7, 40}});
  EXPECT_THAT(codes(followed, kStart + 1), ElementsAre(6, 7, 5));
  EXPECT_EQ(followed.history.neighbours(kStart + 1)[0].levelDbm, -90.0F);
  EXPECT_THAT(codes(followed, kStart), IsEmpty()) << "nothing had been reported then";
}

TEST(Neighbours, areThoseOfAllListsOfTenSeconds) {
  Followed followed;
  followed.lteCell(kStart, 1);
  report(followed, kStart + 1000, {{5, 30}}, 1300);
  report(followed, kStart + 2000, {{5, 35}}, 700);
  EXPECT_EQ(followed.history.neighbours(kStart + 2000).size(), 2U);
  report(followed, kStart + 11'500, {{8, 20}});
  EXPECT_THAT(codes(followed, kStart + 11'500), ElementsAre(5, 8));
}

TEST(Neighbours, areNoneAfterAnEmptyList) {
  Followed followed;
  followed.lteCell(kStart, 1);
  report(followed, kStart + 1, {{5, 30}});
  report(followed, kStart + 2, {});
  EXPECT_THAT(codes(followed, kStart + 2), IsEmpty());
  EXPECT_THAT(codes(followed, kStart + 1), ElementsAre(5));
}

TEST(Neighbours, leaveOutTheCellThatServes) {
  Followed followed;
  followed.lteCell(kStart, 5);
  report(followed, kStart + 1, {{5, 60}, {6, 50}});
  EXPECT_THAT(codes(followed, kStart + 1), ElementsAre(6));
}

TEST(Neighbours, areThoseOfTheTechnologyInUse) {
  Followed followed;
  followed.lteCell(kStart, 1);
  report(followed, kStart + 1, {{6, 50}});
  KCellularGsmScellInfo gsm;
  gsm.setCellId(9);
  followed.feed(kStart + 2, V::K_GSM_SCELL_INFO, gsm);
  EXPECT_THAT(codes(followed, kStart + 2), IsEmpty());
  KCellularGsmGrrEventMeasCr list;
  auto cell = std::make_shared<GsmNcellMeas>();
  cell->setArfcn(26);  // no identity code has been read
  cell->setRxlev(14);
  list.addGsmNcellMeas(cell);
  list.addGsmNcellMeas(std::make_shared<GsmNcellMeas>());
  auto umts = std::make_shared<UmtsNcellMeas>();
  umts->setCpichSc(44);
  umts->setCpichRscp(90);
  umts->setCpichEcn0(20);
  list.addUmtsNcellMeas(umts);
  followed.feed(kStart + 3, V::K_GSM_NCELL_MEAS, list);
  const auto cells = followed.history.neighbours(kStart + 3);
  ASSERT_EQ(cells.size(), 2U) << "the one without a name is none";
  EXPECT_EQ(cells[0].technology, Technology::gsm) << "before a stronger one of another technology";
  EXPECT_EQ(cells[0].channel, 26U);
  EXPECT_FALSE(cells[0].code);
  EXPECT_EQ(cells[0].levelDbm, -96.0F);
  EXPECT_EQ(cells[1].levelDbm, -26.0F);
  EXPECT_EQ(cells[1].qualityDb, -14.5F);
}

TEST(Neighbours, haveTheirLevelsAsACurve) {
  Followed followed;
  followed.lteCell(kStart, 1);
  for (std::int32_t i = 0; i < 10; ++i) {
    report(followed, kStart + 1000 * static_cast<std::uint64_t>(i), {{5, 30 + i}, {6, 20}});
  }
  const Neighbour cell = followed.history.neighbours(kStart + 9000).at(0);
  const auto runs = followed.history.levels(cell, kStart + 2000, kStart + 9000);
  ASSERT_EQ(runs.size(), 1U);
  ASSERT_EQ(runs[0].size(), 8U);
  EXPECT_EQ(runs[0].front().value, -108);
  EXPECT_EQ(runs[0].back().value, -101);
  Neighbour unheardOf = cell;
  unheardOf.code = 77;
  EXPECT_THAT(followed.history.levels(unheardOf, 0, kStart + 9000), IsEmpty());
}

}  // namespace
}  // namespace qel
