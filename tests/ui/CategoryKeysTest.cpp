// Every category key, what it shows and which routine knows it: the store is filled so that each
// record and each entry names itself.

#include <gtest/gtest.h>

#include <array>
#include <ostream>

#include "support/RecordingSink.h"
#include "ui/Tables.h"

namespace qel {
namespace {

using testing::Lines;

enum class Shape {
  record,     // one section, all fields
  list,       // one section an entry
  first,      // one section over the first entry
  cellsOnly,  // one section of one row: only the cells know it
};

struct Key {
  const char* key;
  Shape shape;
  const char* source;
  const char* title = "";
};

void PrintTo(const Key& key, std::ostream* out) { *out << '"' << key.key << '"'; }

constexpr std::array kKeys = {
    Key{"LTE C-DRX", Shape::record, "myLTECDRXConfigDict"},
    Key{"LTE Serving Cell Info", Shape::record, "myLTESCellInfoDict"},
    Key{"LTE RRC State", Shape::record, "myLTERRCStateDict"},
    Key{"LTE Sel Resel Parameters", Shape::record, "myLTE.SelReselCellInfo"},
    Key{"LTE EUTRA Neighbor Info", Shape::list, "myLTE.EutraNbrs", "EUTRA Neighbor "},
    Key{"LTE Tx Power", Shape::list, "myLTE.TxPower", "TxPowerInfo "},
    Key{"LTE NAS", Shape::record, "myLTEEMMContextDict"},
    Key{"LTE Serving Cell Meas", Shape::first, "myLTE.RsrpRsrqSinr"},
    Key{"LTE LTE Neighbor Cell Meas", Shape::list, "myLTE.EutraNbrsMeas", "LTE "},
    Key{"LTE UMTS Neighbor Cell Meas", Shape::list, "myLTE.UtraNbrsMeas", "UMTS Neighbor "},
    Key{"LTE GSM Neighbor Cell Meas", Shape::list, "myLTE.GeraNbrsMeas", "GSM Neighbor "},
    Key{"LTE Component Carrier Info", Shape::cellsOnly, "myLTECompCarrDict"},
    Key{"LTE CA Status", Shape::list, "myLTE.CAStatusList", "Component Carrier "},
    Key{"LTE Active Bearers", Shape::list, "myCommon.activeBearer", "PDP "},
    Key{"UMTS Active Bearers", Shape::list, "myCommon.activeBearer", "PDP "},
    Key{"GSM Active Bearers", Shape::list, "myCommon.activeBearer", "PDP "},
    Key{"UMTS RRC State", Shape::record, "myUMTSRRCStateDict"},
    Key{"UMTS RRC Configuration", Shape::record, "myUMTSRRCConfigDict"},
    Key{"UMTS Serving Cell Info", Shape::record, "myUMTSCellInfoDict"},
    Key{"UMTS Serving Cell Measurement", Shape::cellsOnly, "myUMTS.rXInfo"},
    Key{"UMTS Tx Power", Shape::list, "myUMTS.TxPower", "TxPowerInfo "},
    Key{"UMTS Sel Resel Parameters", Shape::record, "myUMTS.SelReselCellInfo"},
    Key{"UMTS EUTRA Neighbor Info", Shape::list, "myUMTS.eUtraNbrs", "EUTRA Neighbor "},
    Key{"UMTS UTRA Neighbor Info", Shape::list, "myUMTS.utraNbrs", "UTRA Neighbor "},
    Key{"UMTS GSM Neighbor Info", Shape::list, "myUMTS.geraNbrs", "GSM Neighbor "},
    Key{"UMTS LTE Neighbor Cell Meas", Shape::list, "myUMTS.eUtraNbrMeas", "LTE "},
    Key{"UMTS UMTS Neighbor Cell Meas", Shape::list, "myUMTS.utraNbrMeas", "UMTS Neighbor "},
    Key{"UMTS GSM Neighbor Cell Meas", Shape::list, "myUMTS.geraNbrMeas", "GSM Neighbor "},
    Key{"UMTS NAS GMM", Shape::record, "myGMMContextDict"},
    Key{"GSM NAS  MM", Shape::record, "myGMMContextDict"},
    Key{"UMTS NAS MM", Shape::record, "myMMContextDict"},
    Key{"GSM NAS MM", Shape::record, "myMMContextDict"},
    Key{"GSM Serving Cell Info", Shape::cellsOnly, "myGSMScellInfoDict"},
    Key{"GSM Idle Config", Shape::cellsOnly, "myGSMIdleConfigInfoDict"},
    Key{"GSM Idle Serv Cell Meas", Shape::cellsOnly, "myGSMIdleScellMeasDict"},
    Key{"Connected Serv Cell Meas", Shape::cellsOnly, "myGSMConnRfMeasDict"},
    Key{"GSM GPRS Config", Shape::cellsOnly, "myGSMGPRSConfigDict"},
    Key{"GSM LTE Neighbor Cell Meas", Shape::list, "myGSM.eUtraNbrMeas", "LTE "},
    Key{"GSM UMTS Neighbor Cell Meas", Shape::list, "myGSM.utraNbrMeas", "UMTS Neighbor "},
    Key{"GSM GSM Neighbor Cell Meas", Shape::list, "myGSM.geraNbrMeas", "GSM Neighbor "},
    Key{"Device Info SIM Files", Shape::list, "myCommon.simContents", "SIM Content "},
};

Dictionary naming(const char* source) { return {{"source", source}, {"second", 2}}; }

EntryList entriesNaming(const char* source) {
  EntryList entries;
  for (int i = 0; i < 3; ++i) entries.push_back({{"source", source}, {"index", i}});
  return entries;
}

void fillSlots(MetricStore& store) {
  store.myLTERRCStateDict = naming("myLTERRCStateDict");
  store.myLTECDRXConfigDict = naming("myLTECDRXConfigDict");
  store.myLTESCellInfoDict = naming("myLTESCellInfoDict");
  store.myLTESCellMeasDict = naming("myLTESCellMeasDict");
  store.myLTESelReselDict = naming("myLTESelReselDict");
  store.myLTERsrpRsrqSinrDict = naming("myLTERsrpRsrqSinrDict");
  store.myLTECompCarrDict = naming("myLTECompCarrDict");
  store.myLTETxPowerDict = naming("myLTETxPowerDict");
  store.myLTEInterRatMeasDict = naming("myLTEInterRatMeasDict");
  store.myLTEIntraRatMeasDict = naming("myLTEIntraRatMeasDict");
  store.myLTECAStatusDict = naming("myLTECAStatusDict");
  store.myLTEEMMContextDict = naming("myLTEEMMContextDict");
  store.myCellularMMCommonInfoDict = naming("myCellularMMCommonInfoDict");
  store.myCellularActiveBearerDict = naming("myCellularActiveBearerDict");
  store.myGMMContextDict = naming("myGMMContextDict");
  store.myUMTSRRCStateDict = naming("myUMTSRRCStateDict");
  store.myUMTSRRCConfigDict = naming("myUMTSRRCConfigDict");
  store.myUMTSCellInfoDict = naming("myUMTSCellInfoDict");
  store.myUMTSCellMeasDict = naming("myUMTSCellMeasDict");
  store.myUMTSTxPowerDict = naming("myUMTSTxPowerDict");
  store.myUMTSSelReselDict = naming("myUMTSSelReselDict");
  store.myUMTSNbrMeasDict = naming("myUMTSNbrMeasDict");
  store.myGSMScellInfoDict = naming("myGSMScellInfoDict");
  store.myGSMIdleConfigInfoDict = naming("myGSMIdleConfigInfoDict");
  store.myGSMIdleScellMeasDict = naming("myGSMIdleScellMeasDict");
  store.myGSMConnRfMeasDict = naming("myGSMConnRfMeasDict");
  store.myGSMNbrMeasDict = naming("myGSMNbrMeasDict");
  store.myGSMGPRSConfigDict = naming("myGSMGPRSConfigDict");
  store.mySIMFileInfoDict = naming("mySIMFileInfoDict");
  store.myMMContextDict = naming("myMMContextDict");
}

void fillRecords(MetricStore& store) {
  store.myLTE.SelReselCellInfo = naming("myLTE.SelReselCellInfo");
  store.myUMTS.SelReselCellInfo = naming("myUMTS.SelReselCellInfo");
  store.myLTE.EutraNbrs = entriesNaming("myLTE.EutraNbrs");
  store.myLTE.RsrpRsrqSinr = entriesNaming("myLTE.RsrpRsrqSinr");
  store.myLTE.TxPower = entriesNaming("myLTE.TxPower");
  store.myLTE.EutraNbrsMeas = entriesNaming("myLTE.EutraNbrsMeas");
  store.myLTE.UtraNbrsMeas = entriesNaming("myLTE.UtraNbrsMeas");
  store.myLTE.GeraNbrsMeas = entriesNaming("myLTE.GeraNbrsMeas");
  store.myLTE.CAStatusList = entriesNaming("myLTE.CAStatusList");
  store.myLTE.MMCommonInfo = entriesNaming("myLTE.MMCommonInfo");
  store.myUMTS.rXInfo = entriesNaming("myUMTS.rXInfo");
  store.myUMTS.TxPower = entriesNaming("myUMTS.TxPower");
  store.myUMTS.eUtraNbrs = entriesNaming("myUMTS.eUtraNbrs");
  store.myUMTS.utraNbrs = entriesNaming("myUMTS.utraNbrs");
  store.myUMTS.geraNbrs = entriesNaming("myUMTS.geraNbrs");
  store.myUMTS.eUtraNbrMeas = entriesNaming("myUMTS.eUtraNbrMeas");
  store.myUMTS.utraNbrMeas = entriesNaming("myUMTS.utraNbrMeas");
  store.myUMTS.geraNbrMeas = entriesNaming("myUMTS.geraNbrMeas");
  store.myGSM.eUtraNbrMeas = entriesNaming("myGSM.eUtraNbrMeas");
  store.myGSM.utraNbrMeas = entriesNaming("myGSM.utraNbrMeas");
  store.myGSM.geraNbrMeas = entriesNaming("myGSM.geraNbrMeas");
  store.myCommon.activeBearer = entriesNaming("myCommon.activeBearer");
  store.myCommon.simContents = entriesNaming("myCommon.simContents");
}

// The key may be cut anywhere: only the joined text counts.
std::shared_ptr<SecondLevelViewController> tableOf(const std::string& key) {
  const std::size_t blank = key.find(' ');
  return testing::categoryTable(key.substr(0, blank), key.substr(blank + 1));
}

Lines expectedLines(const Key& key) {
  const std::string first = std::string("|source|") + key.source;
  if (key.shape == Shape::cellsOnly) return {"-" + first};
  if (key.shape == Shape::first) return {"-" + first, "-|index|0"};
  if (key.shape == Shape::record) return {"-" + first, "-|second|2"};
  Lines lines;
  for (const char* index : {"0", "1", "2"}) {
    const std::string title = std::string(key.title) + index;
    lines.push_back(title + first);
    lines.push_back(title + "|index|" + index);
  }
  return lines;
}

class CategoryKeys : public ::testing::TestWithParam<Key> {
 protected:
  testing::CapturedSystemLog log;
  testing::CapturedStandardOutput out;
  MetricStore& store = *MetricValidator::shared();
};

TEST_P(CategoryKeys, showTheirSource) {
  fillSlots(store);
  fillRecords(store);
  const auto table = tableOf(GetParam().key);
  EXPECT_EQ(testing::linesOf(snapshotOf(*table)), expectedLines(GetParam()));
  EXPECT_EQ(table->numberOfSections(), GetParam().shape == Shape::list ? 3 : 1);
}

INSTANTIATE_TEST_SUITE_P(All, CategoryKeys, ::testing::ValuesIn(kKeys), [](const auto& instance) {
  std::string name = instance.param.key;
  for (char& character : name) {
    if (std::isalnum(static_cast<unsigned char>(character)) == 0) character = '_';
  }
  return name;
});

}  // namespace
}  // namespace qel
