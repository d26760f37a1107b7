#include "metrics/Derivations.h"

#include <gtest/gtest.h>

#include <csignal>
#include <limits>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/sim.h"
#include "messages/wcdma.h"
#include "metrics/DerivationTables.h"
#include "metrics/Feed.h"

namespace qel {
namespace {

using testing::FedValidator;
using V = MetricValidator;

const BandwidthTable kBandwidths = makeBandwidthTable();
const Value kTime = "2017-07-14 02:40:00 UTC";

Dictionary rewritten(std::span<const Rewrite> rewrites, Dictionary entry) {
  for (const Rewrite& rewrite : rewrites) applyRewrite(rewrite, entry, kBandwidths);
  return entry;
}

template <class Message>
Message stamped() {
  Message message;
  message.setTimestamp(1500000000000);
  return message;
}

TEST(UtraRewrites, turnIndexesIntoDbmAndDb) {
  EXPECT_EQ(rewritten(derivations::kUtraRewrites, {{"rscp", 30}, {"ecno", 20.0F}}),
            (Dictionary{{"rscp", -86}, {"ecno", -14.5F}}));
  EXPECT_EQ(rewritten(derivations::kUtraRewrites, {{"ecno", 20U}}), (Dictionary{{"ecno", -14.5F}}));
}

TEST(GeranRewrites, startAtMinus110) {
  EXPECT_EQ(rewritten(derivations::kGeranRewrites, {{"rxlev", 0}}), (Dictionary{{"rxlev", -110}}));
}

TEST(EutraRewrites, startAtMinus140AndMinus19AndAHalf) {
  EXPECT_EQ(rewritten(derivations::kEutraRewrites, {{"rsrp", 0}, {"rsrq", 0.0F}}),
            (Dictionary{{"rsrp", -140}, {"rsrq", -19.5F}}));
}

TEST(SinrRewrites, halveWithoutAnOffset) {
  EXPECT_EQ(rewritten(derivations::kSinrRewrites, {{"sinr0", 25.0F}, {"sinr1", -3}}),
            (Dictionary{{"sinr0", 12.5F}, {"sinr1", -1.5F}}));
}

TEST(CarrierRewrites, divideHundredthsTowardZero) {
  EXPECT_EQ(rewritten(derivations::kCarrierRewrites,
                      {{"rsrp", -9550}, {"rssi", -7099}, {"rsrq", -1050.0F}, {"dl_bandwidth", 5}}),
            (Dictionary{{"rsrp", -95}, {"rssi", -70}, {"rsrq", -10.5F}, {"dl_bandwidth", 20.0F}}));
  EXPECT_EQ(rewritten(derivations::kCarrierRewrites, {{"rsrp", -1234}, {"rssi", 1299}}),
            (Dictionary{{"rsrp", -12}, {"rssi", 12}}));
}

TEST(Bandwidth, removesACodeThatItDoesNotKnow) {
  for (const Value& code : {Value(9), Value(6U), Value(-1)}) {
    EXPECT_EQ(rewritten(derivations::kCarrierRewrites, {{"dl_bandwidth", code}}), Dictionary());
  }
}

TEST(Rewrites, leaveValuesOfAnotherKindAlone) {
  const Dictionary odd{{"rsrp", "strong"}, {"rsrq", true}, {"dl_bandwidth", 4294967295U}};
  EXPECT_EQ(rewritten(derivations::kCarrierRewrites, odd), odd);
  const Dictionary uneven{{"rsrp", 0.5F}, {"rsrq", 16777217}};
  EXPECT_EQ(rewritten(derivations::kEutraRewrites, uneven), uneven);
  const Dictionary mixed{{"multi_band_info", List{1, "two"}}};
  EXPECT_EQ(rewritten(derivations::kBandList, mixed), mixed);
  EXPECT_EQ(rewritten(derivations::kEutraRewrites, {}), Dictionary());
}

TEST(RewritesDeathTest, endOnAnOverflow) {
  EXPECT_EXIT(
      rewritten(derivations::kGeranRewrites, {{"rxlev", std::numeric_limits<std::int64_t>::min()}}),
      ::testing::KilledBySignal(SIGABRT), "arithmetic overflow in \"rxlev\"");
}

TEST(Rewrites, writeListsAsText) {
  EXPECT_EQ(rewritten(derivations::kBandList, {{"multi_band_info", List{1, 3, 7}}}),
            (Dictionary{{"multi_band_info", "[1, 3, 7]"}}));
  EXPECT_EQ(rewritten(derivations::kTrackingAreaList,
                      {{"tai_list",
                        List{Dictionary{{"encoded_plmn", Bytes{0, 0xF1, 0x10}}, {"tac", 7}}}}}),
            (Dictionary{{"tai_list", R"([{"encoded_plmn": "<00f110>", "tac": 7}])"}}));
}

TEST(ListCopy, carriesTheTimeOfTheReportAndKeepsTheRawList) {
  FedValidator validator;
  auto report = stamped<KCellularLteNbrEutraCellMeas>();
  auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
  cell->setNbrRsrp(53);
  cell->setNbrRsrq(20);
  report.addMeasNbrEutra(cell);
  report.addMeasNbrEutra(std::make_shared<EgwErrcNbrEutraMeas>());
  validator.feed(V::K_LTE_INTRARAT_MEAS, report);
  EXPECT_EQ(validator->myLTE.EutraNbrsMeas,
            (EntryList{{{"nbr_rsrp", -87}, {"nbr_rsrq", -9.5F}, {"timestamp", kTime}},
                       {{"timestamp", kTime}}}));
  EXPECT_EQ(*validator->myLTEIntraRatMeasDict->find("meas_nbr_eutra"),
            Value(List{Dictionary{{"nbr_rsrp", 53}, {"nbr_rsrq", 20}}, Dictionary()}));
}

TEST(ListCopy, givesNoTimeToEntriesOfAReportWithoutOne) {
  FedValidator validator;
  KCellularLteTxPower report;
  auto power = std::make_shared<TxPowerInfo>();
  power->setPuschTxPower(-12);
  report.addTxPowerInfo(power);
  validator.feed(V::K_LTE_TX_POWER, report);
  EXPECT_EQ(validator->myLTE.TxPower, (EntryList{{{"pusch_tx_power", -12}}}));
}

TEST(ListCopy, emptiesTheListOnAReportWithoutEntries) {
  FedValidator validator;
  auto report = stamped<KCellularLteTxPower>();
  report.addTxPowerInfo(std::make_shared<TxPowerInfo>());
  validator.feed(V::K_LTE_TX_POWER, report);
  EXPECT_EQ(validator->myLTE.TxPower.size(), 1U);
  report.clearTxPowerInfos();
  validator.feed(V::K_LTE_TX_POWER, report);
  EXPECT_TRUE(validator->myLTE.TxPower.empty());
}

TEST(ListCopy, countsAListWithAnEntryThatIsNoDictionaryAsAbsent) {
  MetricStore store;
  Dictionary record{{"tx_power_info", List{Dictionary{{"pusch_tx_power", 1}}, 5}}};
  applyDerivation(derivations::kLteTxPower, record, store, kBandwidths);
  EXPECT_TRUE(store.myLTE.TxPower.empty());
}

TEST(UmtsServingCellMeasurement, carriesTheConnectedModeToo) {
  FedValidator validator;
  auto report = stamped<KCellularWcdmaScellMeasurement>();
  report.setConnectedMode(true);
  auto receiver = std::make_shared<RxInfo>();
  receiver->setRssi(-70);
  report.addRxInfo(receiver);
  validator.feed(V::K_UMTS_SCELL_MEAS, report);
  EXPECT_EQ(validator->myUMTS.rXInfo,
            (EntryList{{{"rssi", -70}, {"connected_mode", true}, {"timestamp", kTime}}}));
}

TEST(UmtsTxPower, goesToTheUmtsRecordOnly) {
  FedValidator validator;
  auto report = stamped<KCellularWcdmaTxPower>();
  auto power = std::make_shared<TxPowerInfo>();
  power->setPucchTxPower(3);
  report.addTxPowerInfo(power);
  validator.feed(V::K_UMTS_TX_POWER, report);
  EXPECT_EQ(validator->myUMTS.TxPower, (EntryList{{{"pucch_tx_power", 3}, {"timestamp", kTime}}}));
  EXPECT_EQ(validator->myLTE.TxPower, placeholderList());
}

TEST(UmtsNeighbours, fillThreeLists) {
  FedValidator validator;
  auto report = stamped<KCellularWcdmaNbrCellMeas>();
  auto utra = std::make_shared<UtraCellMeasResult>();
  utra->setRscp(30);
  utra->setEcno(20);
  report.addMeasUtraResult(utra);
  auto gsm = std::make_shared<GsmCellMeasResult>();
  gsm->setRxlev(40);
  report.addMeasGsmResult(gsm);
  auto lte = std::make_shared<LteCellMeasResult>();
  lte->setRsrp(45);
  lte->setRsrq(19);
  report.addMeasLteResult(lte);
  validator.feed(V::K_UMTS_NCELL_MEAS, report);
  EXPECT_EQ(validator->myUMTS.utraNbrMeas,
            (EntryList{{{"rscp", -86}, {"ecno", -14.5F}, {"timestamp", kTime}}}));
  EXPECT_EQ(validator->myUMTS.geraNbrMeas, (EntryList{{{"rxlev", -70}, {"timestamp", kTime}}}));
  EXPECT_EQ(validator->myUMTS.eUtraNbrMeas,
            (EntryList{{{"rsrp", -95}, {"rsrq", -10.0F}, {"timestamp", kTime}}}));
}

TEST(LteInterRatNeighbours, fillTwoLists) {
  FedValidator validator;
  auto report = stamped<KCellularLteNbrInterRatCellMeas>();
  auto utra = std::make_shared<EgwErrcNbrUtraMeas>();
  utra->setRscp(16);
  utra->setEcno(49);
  report.addMeasNbrUtra(utra);
  auto geran = std::make_shared<EgwErrcNbrGeranMeas>();
  geran->setRxlev(63);
  report.addMeasNbrGeran(geran);
  validator.feed(V::K_LTE_INTERRAT_MEAS, report);
  EXPECT_EQ(validator->myLTE.UtraNbrsMeas,
            (EntryList{{{"rscp", -100}, {"ecno", 0.0F}, {"timestamp", kTime}}}));
  EXPECT_EQ(validator->myLTE.GeraNbrsMeas, (EntryList{{{"rxlev", -47}, {"timestamp", kTime}}}));
}

// The rewrite is for "cpich_ecno", the message says "cpich_ecn0": the value stays an index.
TEST(GsmNeighbours, rewriteOnlyTheKeysThatMatchToTheLetter) {
  FedValidator validator;
  auto report = stamped<KCellularGsmGrrEventMeasCr>();
  auto gsm = std::make_shared<GsmNcellMeas>();
  gsm->setRxlev(20);
  report.addGsmNcellMeas(gsm);
  auto umts = std::make_shared<UmtsNcellMeas>();
  umts->setCpichRscp(26);
  umts->setCpichEcn0(20);
  report.addUmtsNcellMeas(umts);
  auto lte = std::make_shared<LteNcellMeas>();
  lte->setRsrp(40);
  lte->setRsrq(10);
  report.addLteNcellMeas(lte);
  validator.feed(V::K_GSM_NCELL_MEAS, report);
  EXPECT_EQ(validator->myGSM.geraNbrMeas, (EntryList{{{"rxlev", -90}, {"timestamp", kTime}}}));
  EXPECT_EQ(validator->myGSM.utraNbrMeas,
            (EntryList{{{"cpich_rscp", -90}, {"cpich_ecn0", 20}, {"timestamp", kTime}}}));
  EXPECT_EQ(validator->myGSM.eUtraNbrMeas,
            (EntryList{{{"rsrp", -100}, {"rsrq", -14.5F}, {"timestamp", kTime}}}));
  EXPECT_EQ(rewritten(derivations::kCpichRewrites, {{"cpich_ecno", 20}}),
            (Dictionary{{"cpich_ecno", -14.5F}}));
}

TEST(LteSignal, halvesInstantValuesOnly) {
  FedValidator validator;
  auto report = stamped<KCellularLteRsrpRsrqSinr>();
  auto values = std::make_shared<RsrpRsrqSinr>();
  values->setRsrp0(-90);
  values->setSinr0(25);
  values->setSinr1(-4);
  report.setAvgValues(values);
  report.addInstValues(values);
  validator.feed(V::K_LTE_RSRP_RSRQ_SINR, report);
  EXPECT_EQ(
      validator->myLTE.RsrpRsrqSinr,
      (EntryList{{{"rsrp0", -90}, {"sinr0", 12.5F}, {"sinr1", -2.0F}, {"timestamp", kTime}}}));
  EXPECT_EQ(*validator->myLTERsrpRsrqSinrDict->find("avg_values"),
            Value(Dictionary{{"rsrp0", -90}, {"sinr0", 25}, {"sinr1", -4}}));
}

TEST(CarrierAggregation, fillsTheCarrierList) {
  FedValidator validator;
  auto report = stamped<KCellularLteCarrierAggregationStatus>();
  auto carrier = std::make_shared<SecondaryComponentCarrier>();
  carrier->setDlBandwidth(3);
  carrier->setUlBandwidth(3);
  carrier->setRsrp(-9550);
  carrier->setRsrq(-1050);
  carrier->setRssi(-7099);
  carrier->setSnr(1200);
  report.addSccList(carrier);
  validator.feed(V::K_LTE_CA_STATUS, report);
  EXPECT_EQ(validator->myLTE.CAStatusList, (EntryList{{{"dl_bandwidth", 10.0F},
                                                       {"ul_bandwidth", 3},
                                                       {"rsrp", -95},
                                                       {"rsrq", -10.5F},
                                                       {"snr", 1200},
                                                       {"rssi", -70},
                                                       {"timestamp", kTime}}}));
}

TEST(LteServingCell, showsItsBandwidthInMhzOrNotAtAll) {
  FedValidator validator;
  KCellularLteScellInfo cell;
  cell.setDlBw(0);
  cell.setUlBw(5);
  validator.feed(V::K_LTE_SCELL_INFO, cell);
  EXPECT_EQ(validator->myLTESCellInfoDict, (Dictionary{{"dl_bw", 1.4F}, {"ul_bw", 5}}));
  cell.setDlBw(6);
  validator.feed(V::K_LTE_SCELL_INFO, cell);
  EXPECT_EQ(validator->myLTESCellInfoDict, (Dictionary{{"ul_bw", 5}}));
}

TEST(EmmContext, showsItsTrackingAreasAsText) {
  FedValidator validator;
  KCellularEmmContext context;
  auto area = std::make_shared<KCellularTrackingAreaId>();
  area->setTac(7);
  context.addTaiList(area);
  validator.feed(V::K_LTE_EMM_CTXT, context);
  EXPECT_EQ(validator->myLTEEMMContextDict, (Dictionary{{"tai_list", R"([{"tac": 7}])"}}));
}

TEST(BearersAndSimFiles, goToTheCommonRecord) {
  FedValidator validator;
  auto bearers = stamped<KCellularActivatedBearerContexts>();
  auto bearer = std::make_shared<BearerContext>();
  bearer->setApn("internet");
  bearers.addBearerContexts(bearer);
  validator.feed(V::K_CELLULAR_ACTIVE_BEARER, bearers);
  auto files = stamped<KCellularSimCardFiles>();
  auto file = std::make_shared<ElementaryFile>();
  file->setEfId(0x6F07);
  file->setContent(Bytes{8});
  files.addEfList(file);
  validator.feed(V::K_SIM_FILE_INFO, files);
  EXPECT_EQ(validator->myCommon.activeBearer,
            (EntryList{{{"apn", "internet"}, {"timestamp", kTime}}}));
  EXPECT_EQ(validator->myCommon.simContents,
            (EntryList{{{"ef_id", 0x6F07}, {"content", Bytes{8}}, {"timestamp", kTime}}}));
}

}  // namespace
}  // namespace qel
