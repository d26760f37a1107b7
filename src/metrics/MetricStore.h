// The newest record of every metric, and the lists that the tables show.
#pragma once

#include <optional>

#include "base/Value.h"
#include "metrics/EntryList.h"

namespace qel {

// Main thread only, no lock. Nothing is ever cleared or aged. A reader that keeps a record copies
// it; changing a copy changes nothing here.

// The one entry of a list that no report has filled yet: "Waiting for Update" both ways.
EntryList placeholderList();

// Records of the LTE tables.
struct LTE {
  LTE();

  Dictionary SelReselCellInfo;  // its keys are fixed at the start and only ever become fewer
  EntryList EutraNbrs = placeholderList();
  EntryList RsrpRsrqSinr = placeholderList();
  EntryList TxPower = placeholderList();
  EntryList EutraNbrsMeas = placeholderList();
  EntryList UtraNbrsMeas = placeholderList();
  EntryList GeraNbrsMeas = placeholderList();
  EntryList CAStatusList = placeholderList();
  EntryList MMCommonInfo = placeholderList();
  Value IMSI = "Come Back Later";
};

// Records of the UMTS tables.
struct UMTS {
  UMTS();

  EntryList rXInfo = placeholderList();
  EntryList TxPower = placeholderList();
  Dictionary SelReselCellInfo;  // as in LTE
  EntryList eUtraNbrs = placeholderList();
  EntryList utraNbrs = placeholderList();
  EntryList geraNbrs = placeholderList();
  EntryList eUtraNbrMeas = placeholderList();
  EntryList utraNbrMeas = placeholderList();
  EntryList geraNbrMeas = placeholderList();
};

// Records of the GSM tables.
struct GSM {
  EntryList eUtraNbrMeas = placeholderList();
  EntryList utraNbrMeas = placeholderList();
  EntryList geraNbrMeas = placeholderList();
};

// Records that belong to no single technology.
struct Common {
  EntryList activeBearer = placeholderList();
  EntryList simContents = placeholderList();
};

// One slot a handled metric, absent until its first report, replaced whole by each.
struct MetricStore {
  using Slot = std::optional<Dictionary>;

  Slot myLTERRCStateDict;
  Slot myLTECDRXConfigDict;
  Slot myLTESCellInfoDict;
  Slot myLTESCellMeasDict;  // no metric fills it
  Slot myLTESelReselDict;
  Slot myLTERsrpRsrqSinrDict;
  Slot myLTECompCarrDict;
  Slot myLTETxPowerDict;
  Slot myLTEInterRatMeasDict;
  Slot myLTEIntraRatMeasDict;
  Slot myLTECAStatusDict;
  Slot myLTEEMMContextDict;
  Slot myCellularMMCommonInfoDict;
  Slot myCellularActiveBearerDict;
  Slot myGMMContextDict;
  Slot myUMTSRRCStateDict;
  Slot myUMTSRRCConfigDict;
  Slot myUMTSCellInfoDict;
  Slot myUMTSCellMeasDict;
  Slot myUMTSTxPowerDict;
  Slot myUMTSSelReselDict;
  Slot myUMTSNbrMeasDict;
  Slot myGSMScellInfoDict;
  Slot myGSMIdleConfigInfoDict;
  Slot myGSMIdleScellMeasDict;
  Slot myGSMConnRfMeasDict;
  Slot myGSMNbrMeasDict;
  Slot myGSMGPRSConfigDict;
  Slot mySIMFileInfoDict;
  Slot myMMContextDict;

  LTE myLTE;
  UMTS myUMTS;
  GSM myGSM;
  Common myCommon;
};

}  // namespace qel
