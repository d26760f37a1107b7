#include "metrics/MetricStore.h"

#include <gtest/gtest.h>

#include <array>

#include "messages/wcdma.h"
#include "metrics/Feed.h"

namespace qel {
namespace {

std::vector<std::string> keysOf(const Dictionary& dictionary) {
  std::vector<std::string> keys;
  for (const auto& entry : dictionary) keys.emplace_back(entry.key.view());
  return keys;
}

constexpr std::array kSlots = {
    &MetricStore::myLTERRCStateDict,          &MetricStore::myLTECDRXConfigDict,
    &MetricStore::myLTESCellInfoDict,         &MetricStore::myLTESCellMeasDict,
    &MetricStore::myLTESelReselDict,          &MetricStore::myLTERsrpRsrqSinrDict,
    &MetricStore::myLTECompCarrDict,          &MetricStore::myLTETxPowerDict,
    &MetricStore::myLTEInterRatMeasDict,      &MetricStore::myLTEIntraRatMeasDict,
    &MetricStore::myLTECAStatusDict,          &MetricStore::myLTEEMMContextDict,
    &MetricStore::myCellularMMCommonInfoDict, &MetricStore::myCellularActiveBearerDict,
    &MetricStore::myGMMContextDict,           &MetricStore::myUMTSRRCStateDict,
    &MetricStore::myUMTSRRCConfigDict,        &MetricStore::myUMTSCellInfoDict,
    &MetricStore::myUMTSCellMeasDict,         &MetricStore::myUMTSTxPowerDict,
    &MetricStore::myUMTSSelReselDict,         &MetricStore::myUMTSNbrMeasDict,
    &MetricStore::myGSMScellInfoDict,         &MetricStore::myGSMIdleConfigInfoDict,
    &MetricStore::myGSMIdleScellMeasDict,     &MetricStore::myGSMConnRfMeasDict,
    &MetricStore::myGSMNbrMeasDict,           &MetricStore::myGSMGPRSConfigDict,
    &MetricStore::mySIMFileInfoDict,          &MetricStore::myMMContextDict,
};
static_assert(kSlots.size() == 30);

TEST(MetricStore, hasNoRecordBeforeAnyMetricArrives) {
  const MetricStore store;
  for (const auto slot : kSlots) EXPECT_FALSE((store.*slot).has_value());
}

TEST(MetricStore, showsThePlaceholderInEveryListBeforeAnyMetricArrives) {
  const MetricStore store;
  const EntryList waiting = {{{"Waiting for Update", "Waiting for Update"}}};
  for (const auto list :
       {&LTE::EutraNbrs, &LTE::RsrpRsrqSinr, &LTE::TxPower, &LTE::EutraNbrsMeas, &LTE::UtraNbrsMeas,
        &LTE::GeraNbrsMeas, &LTE::CAStatusList, &LTE::MMCommonInfo}) {
    EXPECT_EQ(store.myLTE.*list, waiting);
  }
  for (const auto list :
       {&UMTS::rXInfo, &UMTS::TxPower, &UMTS::eUtraNbrs, &UMTS::utraNbrs, &UMTS::geraNbrs,
        &UMTS::eUtraNbrMeas, &UMTS::utraNbrMeas, &UMTS::geraNbrMeas}) {
    EXPECT_EQ(store.myUMTS.*list, waiting);
  }
  for (const auto list : {&GSM::eUtraNbrMeas, &GSM::utraNbrMeas, &GSM::geraNbrMeas}) {
    EXPECT_EQ(store.myGSM.*list, waiting);
  }
  for (const auto list : {&Common::activeBearer, &Common::simContents}) {
    EXPECT_EQ(store.myCommon.*list, waiting);
  }
}

TEST(MetricStore, startsWithAnImsiThatAsksForPatience) {
  EXPECT_EQ(MetricStore().myLTE.IMSI, Value("Come Back Later"));
}

TEST(MetricStore, startsWithTheReselectionKeysAndEmptyTexts) {
  const MetricStore store;
  EXPECT_EQ(keysOf(store.myLTE.SelReselCellInfo),
            (std::vector<std::string>{
                "timestamp", "ims_emergency_support", "ac_barring_for_emergency",
                "mo_signalling_ac_barring_factor", "mo_signalling_ac_barring_time",
                "mo_signalling_ac_barring_for_special_ac", "mo_data_ac_barring_factor",
                "mo_data_ac_barring_time", "mo_data_ac_barring_for_special_ac", "QRxLevMin",
                "QQualMin", "S_non_intra_search_P", "S_non_intra_search_Q", "S_intra_search_P",
                "S_intra_search_Q", "Thresh_serving_lowP", "Thresh_serving_lowQ",
                "priority_operating_freq", "multi_band_info"}));
  EXPECT_EQ(
      keysOf(store.myUMTS.SelReselCellInfo),
      (std::vector<std::string>{
          "timestamp", "ims_emergency_support", "hsdpa_capable", "edch_capable", "duplex_mode",
          "cell_barred", "fach_meas_occ_info_present", "s_rxlev", "s_qual", "s_intrasearch",
          "s_intersearch", "s_search_rat", "s_cell_prio", "multi_band_info"}));
  for (const auto& entry : store.myLTE.SelReselCellInfo) EXPECT_EQ(entry.value, Value(""));
  for (const auto& entry : store.myUMTS.SelReselCellInfo) EXPECT_EQ(entry.value, Value(""));
}

TEST(MetricStore, isNotChangedThroughACopy) {
  const MetricStore store;
  LTE copy = store.myLTE;
  copy.TxPower.clear();
  copy.SelReselCellInfo.remove("QRxLevMin");
  EXPECT_EQ(store.myLTE.TxPower.size(), 1U);
  EXPECT_TRUE(store.myLTE.SelReselCellInfo.contains("QRxLevMin"));
}

TEST(MetricStore, keepsAnEmptyListAfterAReportWithoutEntries) {
  testing::FedValidator validator;
  KCellularWcdmaNbrCellMeas report;
  auto cell = std::make_shared<UtraCellMeasResult>();
  cell->setRscp(30);
  report.addMeasUtraResult(cell);
  validator.feed(MetricValidator::K_UMTS_NCELL_MEAS, report);
  EXPECT_TRUE(validator->myUMTS.geraNbrMeas.empty());
  EXPECT_TRUE(validator->myUMTS.eUtraNbrMeas.empty());
  EXPECT_EQ(validator->myUMTS.utraNbrMeas.size(), 1U);
}

}  // namespace
}  // namespace qel
