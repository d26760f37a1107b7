#include "ui/screens/CategoryTable.h"

#include <algorithm>
#include <array>
#include <initializer_list>

#include "ui/screens/Indexing.h"

namespace qel {
namespace {

// A slot of the store, absent until its first report.
template <auto Slot>
const Dictionary* slot(const MetricStore& store) {
  const MetricStore::Slot& held = store.*Slot;
  return held ? &*held : nullptr;
}

// A record of a technology that is always there.
template <auto Technology, auto Record>
const Dictionary* fixed(const MetricStore& store) {
  return &(store.*Technology.*Record);
}

// A list of a technology.
template <auto Technology, auto List>
const EntryList* list(const MetricStore& store) {
  return &(store.*Technology.*List);
}

using Record = const Dictionary* (*)(const MetricStore&);
using Entries = const EntryList* (*)(const MetricStore&);
using S = MetricStore;

constexpr std::uint8_t bits(std::initializer_list<Routine> routines) {
  unsigned known = 0;
  for (const Routine routine : routines) known |= static_cast<unsigned>(routine);
  return static_cast<std::uint8_t>(known);
}

constexpr std::uint8_t kSectionsRows = bits({Routine::sections, Routine::rows});
constexpr std::uint8_t kRowsCells = bits({Routine::rows, Routine::cells});
constexpr std::uint8_t kCells = bits({Routine::cells});
constexpr std::uint8_t kAll = bits({Routine::sections, Routine::rows, Routine::cells});

constexpr Category one(std::string_view key, Record record, std::uint8_t knownTo = kRowsCells) {
  return {key, knownTo, record, nullptr, ""};
}

constexpr Category first(std::string_view key, Entries list, std::uint8_t knownTo = kRowsCells) {
  return {key, knownTo, nullptr, list, ""};
}

constexpr Category each(std::string_view key, Entries list, std::string_view sectionTitle,
                        std::uint8_t knownTo = kAll) {
  return {key, knownTo, nullptr, list, sectionTitle};
}

// Some keys are known to one routine only, and "GSM NAS  MM" has two blanks: both are meant so.
constexpr std::array kCategories = {
    one("LTE C-DRX", slot<&S::myLTECDRXConfigDict>),
    one("LTE Serving Cell Info", slot<&S::myLTESCellInfoDict>),
    one("LTE RRC State", slot<&S::myLTERRCStateDict>),
    one("LTE Sel Resel Parameters", fixed<&S::myLTE, &LTE::SelReselCellInfo>),
    each("LTE EUTRA Neighbor Info", list<&S::myLTE, &LTE::EutraNbrs>, "EUTRA Neighbor "),
    each("LTE Tx Power", list<&S::myLTE, &LTE::TxPower>, "TxPowerInfo "),
    one("LTE NAS", slot<&S::myLTEEMMContextDict>),
    first("LTE Serving Cell Meas", list<&S::myLTE, &LTE::RsrpRsrqSinr>),
    each("LTE LTE Neighbor Cell Meas", list<&S::myLTE, &LTE::EutraNbrsMeas>, "LTE "),
    each("LTE UMTS Neighbor Cell Meas", list<&S::myLTE, &LTE::UtraNbrsMeas>, "UMTS Neighbor "),
    each("LTE GSM Neighbor Cell Meas", list<&S::myLTE, &LTE::GeraNbrsMeas>, "GSM Neighbor "),
    one("LTE Component Carrier Info", slot<&S::myLTECompCarrDict>, kCells),
    each("LTE CA Status", list<&S::myLTE, &LTE::CAStatusList>, "Component Carrier "),
    each("LTE Active Bearers", list<&S::myCommon, &Common::activeBearer>, "PDP "),
    each("UMTS Active Bearers", list<&S::myCommon, &Common::activeBearer>, "PDP "),
    each("GSM Active Bearers", list<&S::myCommon, &Common::activeBearer>, "PDP "),
    one("UMTS RRC State", slot<&S::myUMTSRRCStateDict>),
    one("UMTS RRC Configuration", slot<&S::myUMTSRRCConfigDict>),
    one("UMTS Serving Cell Info", slot<&S::myUMTSCellInfoDict>),
    each("UMTS Serving Cell Meas", list<&S::myUMTS, &UMTS::rXInfo>, "RxInfo ", kSectionsRows),
    first("UMTS Serving Cell Measurement", list<&S::myUMTS, &UMTS::rXInfo>, kCells),
    each("UMTS Tx Power", list<&S::myUMTS, &UMTS::TxPower>, "TxPowerInfo "),
    one("UMTS Sel Resel Parameters", fixed<&S::myUMTS, &UMTS::SelReselCellInfo>),
    each("UMTS EUTRA Neighbor Info", list<&S::myUMTS, &UMTS::eUtraNbrs>, "EUTRA Neighbor "),
    each("UMTS UTRA Neighbor Info", list<&S::myUMTS, &UMTS::utraNbrs>, "UTRA Neighbor "),
    each("UMTS GSM Neighbor Info", list<&S::myUMTS, &UMTS::geraNbrs>, "GSM Neighbor "),
    each("UMTS LTE Neighbor Cell Meas", list<&S::myUMTS, &UMTS::eUtraNbrMeas>, "LTE "),
    each("UMTS UMTS Neighbor Cell Meas", list<&S::myUMTS, &UMTS::utraNbrMeas>, "UMTS Neighbor "),
    each("UMTS GSM Neighbor Cell Meas", list<&S::myUMTS, &UMTS::geraNbrMeas>, "GSM Neighbor "),
    one("UMTS NAS GMM", slot<&S::myGMMContextDict>),
    one("GSM NAS  MM", slot<&S::myGMMContextDict>),
    one("UMTS NAS MM", slot<&S::myMMContextDict>),
    one("GSM NAS MM", slot<&S::myMMContextDict>),
    one("GSM Serving Cell Info", slot<&S::myGSMScellInfoDict>, kCells),
    one("GSM Idle Config", slot<&S::myGSMIdleConfigInfoDict>, kCells),
    one("GSM Idle Serv Cell Meas", slot<&S::myGSMIdleScellMeasDict>, kCells),
    one("Connected Serv Cell Meas", slot<&S::myGSMConnRfMeasDict>, kCells),
    one("GSM GPRS Config", slot<&S::myGSMGPRSConfigDict>, kCells),
    each("GSM LTE Neighbor Cell Meas", list<&S::myGSM, &GSM::eUtraNbrMeas>, "LTE "),
    each("GSM UMTS Neighbor Cell Meas", list<&S::myGSM, &GSM::utraNbrMeas>, "UMTS Neighbor "),
    each("GSM GSM Neighbor Cell Meas", list<&S::myGSM, &GSM::geraNbrMeas>, "GSM Neighbor "),
    each("Device Info SIM Files", list<&S::myCommon, &Common::simContents>, "SIM Content "),
};

}  // namespace

const Dictionary* Category::recordOfSection(const MetricStore& store, int section) const {
  if (record) return record(store);
  return &elementAt(*list(store), section, "section of " + std::string(key));
}

const Category* findCategory(std::string_view key, Routine routine) {
  const auto matches = [key, routine](const Category& category) {
    return category.key == key && (category.knownTo & static_cast<std::uint8_t>(routine)) != 0;
  };
  const auto found = std::find_if(kCategories.begin(), kCategories.end(), matches);
  return found == kCategories.end() ? nullptr : &*found;
}

}  // namespace qel
