#include "metrics/DispatchTable.h"

#include <algorithm>
#include <array>
#include <bit>
#include <limits>
#include <numeric>

#include "messages/gsm.h"
#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "messages/nas.h"
#include "messages/sim.h"
#include "messages/wcdma.h"
#include "metrics/DerivationTables.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

using Validator = MetricValidator;
using Store = MetricStore;

template <class Message>
constexpr DispatchRow row(std::int64_t identifier, Store::Slot Store::*slot,
                          std::string_view logText,
                          const Derivation& derivation = derivations::kNone) {
  return {identifier, Message::dictionaryWithData, slot, logText, derivation};
}

constexpr std::array kDispatchTable = {
    row<KCellularLteCdrxConfig>(Validator::K_LTE_CDRX_CONFIG, &Store::myLTECDRXConfigDict,
                                "Current CDRX Config is "),
    row<KCellularLteRrcState>(Validator::K_LTE_RRC_STATE, &Store::myLTERRCStateDict,
                              "Current RRC state is "),
    row<KCellularLteScellInfo>(Validator::K_LTE_SCELL_INFO, &Store::myLTESCellInfoDict,
                               "Current Serving Cell Info is ", derivations::kLteServingCell),
    row<KCellularLteSelReselCellInfo>(Validator::K_LTE_SEL_RESEL_INFO, &Store::myLTESelReselDict,
                                      "Received LTE Cell Resel Info is ",
                                      derivations::kLteReselection),
    row<KCellularLteTxPower>(Validator::K_LTE_TX_POWER, &Store::myLTETxPowerDict,
                             "Received LTE Tx Power is ", derivations::kLteTxPower),
    row<KCellularLteRsrpRsrqSinr>(Validator::K_LTE_RSRP_RSRQ_SINR, &Store::myLTERsrpRsrqSinrDict,
                                  "Received RSRP RSRQ SINR is : ", derivations::kLteSignal),
    row<KCellularLteComponentCarrierInfo>(Validator::K_LTE_COMPCARR_INFO, &Store::myLTECompCarrDict,
                                          "Received Component Carrier info is "),
    row<KCellularLteCarrierAggregationStatus>(Validator::K_LTE_CA_STATUS, &Store::myLTECAStatusDict,
                                              "Received CA Status Dict is ",
                                              derivations::kLteCarrierAggregation),
    row<KCellularLteNbrInterRatCellMeas>(
        Validator::K_LTE_INTERRAT_MEAS, &Store::myLTEInterRatMeasDict,
        "Received LTE InterRat Meas Info is ", derivations::kLteInterRatNeighbours),
    row<KCellularLteNbrEutraCellMeas>(Validator::K_LTE_INTRARAT_MEAS, &Store::myLTEIntraRatMeasDict,
                                      "Received LTE IRAT Meas is ", derivations::kLteNeighbours),
    row<KCellularMmCommonInfo>(Validator::K_CELLULAR_MM_INFO, &Store::myCellularMMCommonInfoDict,
                               "Received MM Common Info Dict is : "),
    row<KCellularActivatedBearerContexts>(
        Validator::K_CELLULAR_ACTIVE_BEARER, &Store::myCellularActiveBearerDict,
        "Received Bearer Context Info is ", derivations::kActiveBearers),
    row<KCellularEmmContext>(Validator::K_LTE_EMM_CTXT, &Store::myLTEEMMContextDict,
                             "Received EMM Context is ", derivations::kEmmContext),
    row<KCellularMmContext>(Validator::K_CELLULAR_MM_CTXT, &Store::myMMContextDict,
                            "Received MM Context Info is "),
    row<KCellularGmmContext>(Validator::K_CELLULAR_GMM_CTXT, &Store::myGMMContextDict,
                             "Received GMM Context Info is "),
    row<KCellularWcdmaRrcConnectionState>(Validator::K_UMTS_RRC_STATE, &Store::myUMTSRRCStateDict,
                                          "Received UMTS RRC Connection State is "),
    row<KCellularWcdmaRrcConfiguration>(Validator::K_UMTS_RRC_CONFIG, &Store::myUMTSRRCConfigDict,
                                        "Received UMTS RRC Configuration is "),
    row<KCellularWcdmaCellInfo>(Validator::K_UMTS_SCELL_INFO, &Store::myUMTSCellInfoDict,
                                "Received UMTS Serving Cell Info is "),
    row<KCellularWcdmaScellMeasurement>(Validator::K_UMTS_SCELL_MEAS, &Store::myUMTSCellMeasDict,
                                        "Received UMTS Serving Cell Meas is ",
                                        derivations::kUmtsServingCellMeasurement),
    row<KCellularWcdmaTxPower>(Validator::K_UMTS_TX_POWER, &Store::myUMTSTxPowerDict,
                               "Received Tx Power is ", derivations::kUmtsTxPower),
    row<KCellularWcdmaSelReselCellInfo>(
        Validator::K_UMTS_SEL_RESEL_INFO, &Store::myUMTSSelReselDict,
        "Received UMTS Cell Resel Info is ", derivations::kUmtsReselection),
    row<KCellularWcdmaNbrCellMeas>(Validator::K_UMTS_NCELL_MEAS, &Store::myUMTSNbrMeasDict,
                                   "Received UMTS InterRat Meas Info is ",
                                   derivations::kUmtsNeighbours),
    row<KCellularGsmScellInfo>(Validator::K_GSM_SCELL_INFO, &Store::myGSMScellInfoDict,
                               "Received GSM Serving Cell Info "),
    row<KCellularGsmIdleConfig>(Validator::K_GSM_IDLE_CONFIG, &Store::myGSMIdleConfigInfoDict,
                                "Received GSM Idle Config Info is "),
    row<KCellularGsmIdleScellMeasurement>(Validator::K_GSM_IDLE_SCELL_MEAS,
                                          &Store::myGSMIdleScellMeasDict,
                                          "Received GSM Idle Serving Cell Meas Info is "),
    row<KCellularGsmCsRfMeasurement>(Validator::K_GSM_CS_RF_MEAS, &Store::myGSMConnRfMeasDict,
                                     "Received GSM Connected Serving Cell Meas Info is "),
    row<KCellularGsmGrrEventMeasCr>(Validator::K_GSM_NCELL_MEAS, &Store::myGSMNbrMeasDict,
                                    "Received GSM Nbr Cell Meas Info is ",
                                    derivations::kGsmNeighbours),
    row<KCellularGsmGprsConfig>(Validator::K_GSM_GPRS_CONFIG, &Store::myGSMGPRSConfigDict,
                                "Received GSM GPRS Config Info is "),
    row<KCellularSimCardFiles>(Validator::K_SIM_FILE_INFO, &Store::mySIMFileInfoDict,
                               "Received SIM Card File Info is ", derivations::kSimFiles),
};

static_assert(kDispatchTable.size() == 29);

constexpr auto kByIdentifier = [] {
  std::array<std::uint8_t, kDispatchTable.size()> places{};
  std::iota(places.begin(), places.end(), std::uint8_t{0});
  std::ranges::sort(places, {}, [](auto place) { return kDispatchTable[place].identifier; });
  return places;
}();

// Their identifiers, with others behind them that no metric has.
constexpr std::size_t kPlaces = std::bit_ceil(kByIdentifier.size());
constexpr auto kIdentifiers = [] {
  std::array<std::int64_t, kPlaces> identifiers{};
  identifiers.fill(std::numeric_limits<std::int64_t>::max());
  std::ranges::transform(kByIdentifier, identifiers.begin(),
                         [](auto place) { return kDispatchTable[place].identifier; });
  return identifiers;
}();
static_assert(kPlaces > kByIdentifier.size());

}  // namespace

std::span<const DispatchRow> dispatchTable() { return kDispatchTable; }

// Halves the places without a branch.
const DispatchRow* findDispatchRow(std::int64_t identifier) {
  std::size_t found = 0;
  for (std::size_t half = kPlaces / 2; half > 0; half /= 2) {
    found += kIdentifiers[found + half - 1] < identifier ? half : 0;
  }
  if (found >= kByIdentifier.size() || kIdentifiers[found] != identifier) return nullptr;
  return &kDispatchTable[kByIdentifier[found]];
}

}  // namespace qel
