// qelctl store: everything that the store holds after a recording.

#include <CLI/CLI.hpp>
#include <array>
#include <memory>

#include "base/LogSink.h"
#include "base/Rendering.h"
#include "metrics/MetricValidator.h"
#include "tools/Commands.h"
#include "tools/RecordingFeed.h"

namespace qel::tools {
namespace {

struct NamedSlot {
  std::string_view name;
  MetricStore::Slot MetricStore::*slot;
};

#define QEL_SLOT(name) \
  NamedSlot { #name, &MetricStore::name }
constexpr std::array kSlots = {
    QEL_SLOT(myLTERRCStateDict),          QEL_SLOT(myLTECDRXConfigDict),
    QEL_SLOT(myLTESCellInfoDict),         QEL_SLOT(myLTESCellMeasDict),
    QEL_SLOT(myLTESelReselDict),          QEL_SLOT(myLTERsrpRsrqSinrDict),
    QEL_SLOT(myLTECompCarrDict),          QEL_SLOT(myLTETxPowerDict),
    QEL_SLOT(myLTEInterRatMeasDict),      QEL_SLOT(myLTEIntraRatMeasDict),
    QEL_SLOT(myLTECAStatusDict),          QEL_SLOT(myLTEEMMContextDict),
    QEL_SLOT(myCellularMMCommonInfoDict), QEL_SLOT(myCellularActiveBearerDict),
    QEL_SLOT(myGMMContextDict),           QEL_SLOT(myUMTSRRCStateDict),
    QEL_SLOT(myUMTSRRCConfigDict),        QEL_SLOT(myUMTSCellInfoDict),
    QEL_SLOT(myUMTSCellMeasDict),         QEL_SLOT(myUMTSTxPowerDict),
    QEL_SLOT(myUMTSSelReselDict),         QEL_SLOT(myUMTSNbrMeasDict),
    QEL_SLOT(myGSMScellInfoDict),         QEL_SLOT(myGSMIdleConfigInfoDict),
    QEL_SLOT(myGSMIdleScellMeasDict),     QEL_SLOT(myGSMConnRfMeasDict),
    QEL_SLOT(myGSMNbrMeasDict),           QEL_SLOT(myGSMGPRSConfigDict),
    QEL_SLOT(mySIMFileInfoDict),          QEL_SLOT(myMMContextDict),
};
#undef QEL_SLOT
static_assert(kSlots.size() == 30);

Value listOf(const EntryList& entries) { return List(entries.begin(), entries.end()); }

Dictionary slotsOf(const MetricStore& store) {
  Dictionary slots;
  for (const auto& [name, slot] : kSlots) {
    slots.append(name, store.*slot ? Value(*(store.*slot)) : Value());
  }
  return slots;
}

Dictionary recordOf(const LTE& lte) {
  return {{"SelReselCellInfo", lte.SelReselCellInfo},   {"EutraNbrs", listOf(lte.EutraNbrs)},
          {"RsrpRsrqSinr", listOf(lte.RsrpRsrqSinr)},   {"TxPower", listOf(lte.TxPower)},
          {"EutraNbrsMeas", listOf(lte.EutraNbrsMeas)}, {"UtraNbrsMeas", listOf(lte.UtraNbrsMeas)},
          {"GeraNbrsMeas", listOf(lte.GeraNbrsMeas)},   {"CAStatusList", listOf(lte.CAStatusList)},
          {"MMCommonInfo", listOf(lte.MMCommonInfo)},   {"IMSI", lte.IMSI}};
}

Dictionary recordOf(const UMTS& umts) {
  return {{"rXInfo", listOf(umts.rXInfo)},
          {"TxPower", listOf(umts.TxPower)},
          {"SelReselCellInfo", umts.SelReselCellInfo},
          {"eUtraNbrs", listOf(umts.eUtraNbrs)},
          {"utraNbrs", listOf(umts.utraNbrs)},
          {"geraNbrs", listOf(umts.geraNbrs)},
          {"eUtraNbrMeas", listOf(umts.eUtraNbrMeas)},
          {"utraNbrMeas", listOf(umts.utraNbrMeas)},
          {"geraNbrMeas", listOf(umts.geraNbrMeas)}};
}

Dictionary recordOf(const GSM& gsm) {
  return {{"eUtraNbrMeas", listOf(gsm.eUtraNbrMeas)},
          {"utraNbrMeas", listOf(gsm.utraNbrMeas)},
          {"geraNbrMeas", listOf(gsm.geraNbrMeas)}};
}

Dictionary recordOf(const Common& common) {
  return {{"activeBearer", listOf(common.activeBearer)},
          {"simContents", listOf(common.simContents)}};
}

}  // namespace

void addStoreCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("store", "Print the store after a recording, as JSON");
  const auto options = std::make_shared<RecordingOptions>();
  addRecordingOptions(*command, *options);
  command->callback([options, &chosen] {
    chosen = [options](Output& output) {
      setStandardOutput(nullptr);
      feedRecording(*options);
      const MetricStore& store = *MetricValidator::shared();
      output.line(jsonText(Dictionary{{"slots", slotsOf(store)},
                                      {"myLTE", recordOf(store.myLTE)},
                                      {"myUMTS", recordOf(store.myUMTS)},
                                      {"myGSM", recordOf(store.myGSM)},
                                      {"myCommon", recordOf(store.myCommon)}}));
    };
  });
}

}  // namespace qel::tools
