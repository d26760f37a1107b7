#include <gtest/gtest.h>

#include "messages/lte_serving.h"
#include "messages/wcdma.h"
#include "metrics/Feed.h"

namespace qel {
namespace {

using testing::FedValidator;
using V = MetricValidator;

KCellularLteSelReselCellInfo lteReport() {
  KCellularLteSelReselCellInfo report;
  report.setTimestamp(1500000000000);
  for (const std::uint32_t band : {1U, 3U, 7U}) report.addMultiBandInfo(band);
  report.setQRxLevMin(-124);
  report.setQHyst(4);
  return report;
}

TEST(LteReselection, projectsAReportOntoTheKeysOfTheTable) {
  FedValidator validator;
  validator.feed(V::K_LTE_SEL_RESEL_INFO, lteReport());
  EXPECT_EQ(validator->myLTE.SelReselCellInfo, (Dictionary{{"timestamp", "2017-07-14 02:40:00 UTC"},
                                                           {"QRxLevMin", -124},
                                                           {"multi_band_info", "[1, 3, 7]"}}));
  EXPECT_EQ(validator->myLTE.SelReselCellInfo.at(1).key.view(), "QRxLevMin");
  EXPECT_EQ(*validator->myLTESelReselDict->find("Q_hyst"), Value(4));
  EXPECT_EQ(*validator->myLTESelReselDict->find("multi_band_info"), Value("[1, 3, 7]"));
}

TEST(LteReselection, neverShowsAKeyAgainThatAReportLacked) {
  FedValidator validator;
  validator.feed(V::K_LTE_SEL_RESEL_INFO, lteReport());
  KCellularLteSelReselCellInfo complete = lteReport();
  complete.setQQualMin(-20);
  complete.setSIntraSearchP(31);
  validator.feed(V::K_LTE_SEL_RESEL_INFO, complete);
  EXPECT_FALSE(validator->myLTE.SelReselCellInfo.contains("QQualMin"));
  EXPECT_FALSE(validator->myLTE.SelReselCellInfo.contains("S_intra_search_P"));
  EXPECT_EQ(validator->myLTE.SelReselCellInfo.size(), 3U);
}

TEST(LteReselection, neverShowsTheThresholdWhoseNumberIsAMetric) {
  FedValidator validator;
  KCellularLteSelReselCellInfo report = lteReport();
  report.setThreshServingLowP(8);
  report.setThreshServingLowQ(9);
  validator.feed(V::K_LTE_SEL_RESEL_INFO, report);
  EXPECT_EQ(*validator->myLTE.SelReselCellInfo.find("Thresh_serving_lowP"), Value(8));
  EXPECT_FALSE(validator->myLTE.SelReselCellInfo.contains("Thresh_serving_lowQ"));
  EXPECT_EQ(validator.log.lines(),
            (std::vector<std::string>{"valid metricId tag", "Unknown tag: 13:9"}));
}

TEST(LteReselection, copiesNeighboursWithTheirBandwidth) {
  FedValidator validator;
  KCellularLteSelReselCellInfo report = lteReport();
  for (const std::uint32_t code : {5U, 6U}) {
    auto neighbour = std::make_shared<NbrEutra>();
    neighbour->setEarfcn(1300);
    neighbour->setDlBw(code);
    report.addNbrEutra(neighbour);
  }
  validator.feed(V::K_LTE_SEL_RESEL_INFO, report);
  const Value time = "2017-07-14 02:40:00 UTC";
  EXPECT_EQ(validator->myLTE.EutraNbrs,
            (EntryList{{{"earfcn", 1300}, {"dl_bw", 20.0F}, {"timestamp", time}},
                       {{"earfcn", 1300}, {"timestamp", time}}}));
}

TEST(UmtsReselection, projectsAndFillsThreePriorityLists) {
  FedValidator validator;
  KCellularWcdmaSelReselCellInfo report;
  report.setSCellPrio(3);
  report.setDuplexMode(0);
  auto lte = std::make_shared<EutraFreqInfo>();
  lte->setEarfcn(1300);
  report.addEutraPrioInfo(lte);
  auto umts = std::make_shared<UtraFreqInfo>();
  umts->setUarfcn(10700);
  report.addUtraPrioInfo(umts);
  auto gsm = std::make_shared<GsmFreqInfo>();
  gsm->setArfcn(60);
  report.addGsmPrioInfo(gsm);
  validator.feed(V::K_UMTS_SEL_RESEL_INFO, report);
  EXPECT_EQ(validator->myUMTS.SelReselCellInfo,
            (Dictionary{{"duplex_mode", "FDD"}, {"s_cell_prio", 3}, {"multi_band_info", "[]"}}));
  EXPECT_EQ(validator->myUMTS.eUtraNbrs, (EntryList{{{"earfcn", 1300}}}));
  EXPECT_EQ(validator->myUMTS.utraNbrs, (EntryList{{{"uarfcn", 10700}}}));
  EXPECT_EQ(validator->myUMTS.geraNbrs, (EntryList{{{"arfcn", 60}}}));
}

}  // namespace
}  // namespace qel
