#include "metrics/DispatchTable.h"

#include <gtest/gtest.h>

#include <set>

#include "messages/catalogue/KBBMetricUtility.h"
#include "messages/sim.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

using V = MetricValidator;
using S = MetricStore;

// One handler as a reader of the catalogue would expect it.
struct Expected {
  std::int64_t identifier;
  std::int64_t constant;
  std::string_view className;
  S::Slot S::*slot;
  std::string_view logText;
};

const Expected kExpected[] = {
    {3952152, V::K_LTE_CDRX_CONFIG, "KCellularLteCdrxConfig", &S::myLTECDRXConfigDict,
     "Current CDRX Config is "},
    {3952132, V::K_LTE_RRC_STATE, "KCellularLteRrcState", &S::myLTERRCStateDict,
     "Current RRC state is "},
    {3948738, V::K_LTE_SCELL_INFO, "KCellularLteScellInfo", &S::myLTESCellInfoDict,
     "Current Serving Cell Info is "},
    {3986190, V::K_LTE_SEL_RESEL_INFO, "KCellularLteSelReselCellInfo", &S::myLTESelReselDict,
     "Received LTE Cell Resel Info is "},
    {3986178, V::K_LTE_TX_POWER, "KCellularLteTxPower", &S::myLTETxPowerDict,
     "Received LTE Tx Power is "},
    {3952490, V::K_LTE_RSRP_RSRQ_SINR, "KCellularLteRsrpRsrqSinr", &S::myLTERsrpRsrqSinrDict,
     "Received RSRP RSRQ SINR is : "},
    {3986187, V::K_LTE_COMPCARR_INFO, "KCellularLteComponentCarrierInfo", &S::myLTECompCarrDict,
     "Received Component Carrier info is "},
    {3986195, V::K_LTE_CA_STATUS, "KCellularLteCarrierAggregationStatus", &S::myLTECAStatusDict,
     "Received CA Status Dict is "},
    {3986192, V::K_LTE_INTERRAT_MEAS, "KCellularLteNbrInterRatCellMeas", &S::myLTEInterRatMeasDict,
     "Received LTE InterRat Meas Info is "},
    {3986191, V::K_LTE_INTRARAT_MEAS, "KCellularLteNbrEutraCellMeas", &S::myLTEIntraRatMeasDict,
     "Received LTE IRAT Meas is "},
    {3986697, V::K_CELLULAR_MM_INFO, "KCellularMmCommonInfo", &S::myCellularMMCommonInfoDict,
     "Received MM Common Info Dict is : "},
    {3986701, V::K_CELLULAR_ACTIVE_BEARER, "KCellularActivatedBearerContexts",
     &S::myCellularActiveBearerDict, "Received Bearer Context Info is "},
    {3986700, V::K_LTE_EMM_CTXT, "KCellularEmmContext", &S::myLTEEMMContextDict,
     "Received EMM Context is "},
    {3986698, V::K_CELLULAR_MM_CTXT, "KCellularMmContext", &S::myMMContextDict,
     "Received MM Context Info is "},
    {3986699, V::K_CELLULAR_GMM_CTXT, "KCellularGmmContext", &S::myGMMContextDict,
     "Received GMM Context Info is "},
    {3985682, V::K_UMTS_RRC_STATE, "KCellularWcdmaRrcConnectionState", &S::myUMTSRRCStateDict,
     "Received UMTS RRC Connection State is "},
    {3985683, V::K_UMTS_RRC_CONFIG, "KCellularWcdmaRrcConfiguration", &S::myUMTSRRCConfigDict,
     "Received UMTS RRC Configuration is "},
    {3944460, V::K_UMTS_SCELL_INFO, "KCellularWcdmaCellInfo", &S::myUMTSCellInfoDict,
     "Received UMTS Serving Cell Info is "},
    {3985666, V::K_UMTS_SCELL_MEAS, "KCellularWcdmaScellMeasurement", &S::myUMTSCellMeasDict,
     "Received UMTS Serving Cell Meas is "},
    {3985667, V::K_UMTS_TX_POWER, "KCellularWcdmaTxPower", &S::myUMTSTxPowerDict,
     "Received Tx Power is "},
    {3985668, V::K_UMTS_SEL_RESEL_INFO, "KCellularWcdmaSelReselCellInfo", &S::myUMTSSelReselDict,
     "Received UMTS Cell Resel Info is "},
    {3985669, V::K_UMTS_NCELL_MEAS, "KCellularWcdmaNbrCellMeas", &S::myUMTSNbrMeasDict,
     "Received UMTS InterRat Meas Info is "},
    {3943948, V::K_GSM_SCELL_INFO, "KCellularGsmScellInfo", &S::myGSMScellInfoDict,
     "Received GSM Serving Cell Info "},
    {3985409, V::K_GSM_IDLE_CONFIG, "KCellularGsmIdleConfig", &S::myGSMIdleConfigInfoDict,
     "Received GSM Idle Config Info is "},
    {3985410, V::K_GSM_IDLE_SCELL_MEAS, "KCellularGsmIdleScellMeasurement",
     &S::myGSMIdleScellMeasDict, "Received GSM Idle Serving Cell Meas Info is "},
    {3985411, V::K_GSM_CS_RF_MEAS, "KCellularGsmCsRfMeasurement", &S::myGSMConnRfMeasDict,
     "Received GSM Connected Serving Cell Meas Info is "},
    {3985417, V::K_GSM_NCELL_MEAS, "KCellularGsmGrrEventMeasCr", &S::myGSMNbrMeasDict,
     "Received GSM Nbr Cell Meas Info is "},
    {3985420, V::K_GSM_GPRS_CONFIG, "KCellularGsmGprsConfig", &S::myGSMGPRSConfigDict,
     "Received GSM GPRS Config Info is "},
    {3932179, V::K_SIM_FILE_INFO, "KCellularSimCardFiles", &S::mySIMFileInfoDict,
     "Received SIM Card File Info is "},
};

TEST(DispatchTable, pairsEachIdentifierWithItsClassSlotAndLogText) {
  for (const Expected& expected : kExpected) {
    SCOPED_TRACE(expected.identifier);
    EXPECT_EQ(expected.identifier, expected.constant);
    const DispatchRow* row = findDispatchRow(expected.identifier);
    ASSERT_NE(row, nullptr);
    const auto* metric =
        findMetricMessage(static_cast<std::uint32_t>(expected.identifier - kMetricEventBase));
    ASSERT_NE(metric, nullptr);
    EXPECT_EQ(metric->className, expected.className);
    EXPECT_EQ(row->describe, metric->describe);
    EXPECT_TRUE(row->slot == expected.slot);
    EXPECT_EQ(row->logText, expected.logText);
  }
  EXPECT_EQ(dispatchTable().size(), std::size(kExpected));
}

TEST(DispatchTable, handlesOnlyMetricsOfTheCatalogue) {
  std::set<std::int64_t> catalogue;
  for (const auto& metric : KBBMetricUtility::catalogue()) {
    catalogue.insert(std::int64_t{metric.identifier} + kMetricEventBase);
  }
  for (const DispatchRow& row : dispatchTable()) catalogue.erase(row.identifier);
  EXPECT_EQ(catalogue, (std::set<std::int64_t>{V::K_LTE_RLF, V::K_LTE_SCELL_MEAS}));
}

TEST(DispatchTable, usesNoSlotTwiceAndLeavesOneUnused) {
  for (const DispatchRow& a : dispatchTable()) {
    EXPECT_FALSE(a.slot == &S::myLTESCellMeasDict);
    for (const DispatchRow& b : dispatchTable()) {
      EXPECT_TRUE(&a == &b || a.slot != b.slot);
    }
  }
}

}  // namespace
}  // namespace qel
