// The derivations of every handler that has any. Header only: constant rows.
#pragma once

#include <array>

#include "metrics/Derivations.h"

namespace qel::derivations {

// Index to unit: RSRP (3GPP TS 36.133, 9.1.4) and CPICH RSCP (TS 25.133, 9.1.1) in dBm, RXLEV in
// dBm (TS 45.008, 8.1.4), RSRQ (TS 36.133, 9.1.7) and CPICH Ec/N0 (TS 25.133, 9.1.2) in half dB.
constexpr Rewrite rsrpDbm(Name key) {
  return {.key = key, .kind = Rewrite::Kind::addInteger, .operand = -140};
}
constexpr Rewrite rsrqDb(Name key) {
  return {.key = key, .kind = Rewrite::Kind::scaleFloat, .factor = 0.5F, .offset = -19.5F};
}
constexpr Rewrite rscpDbm(Name key) {
  return {.key = key, .kind = Rewrite::Kind::addInteger, .operand = -116};
}
constexpr Rewrite ecnoDb(Name key) {
  return {.key = key, .kind = Rewrite::Kind::scaleFloat, .factor = 0.5F, .offset = -24.5F};
}
constexpr Rewrite rxlevDbm(Name key) {
  return {.key = key, .kind = Rewrite::Kind::addInteger, .operand = -110};
}
constexpr Rewrite halfDb(Name key) {
  return {.key = key, .kind = Rewrite::Kind::scaleFloat, .factor = 0.5F, .offset = 0.0F};
}
constexpr Rewrite wholeOfHundredths(Name key) {
  return {.key = key, .kind = Rewrite::Kind::divideInteger, .operand = 100};
}
constexpr Rewrite hundredths(Name key) {
  return {.key = key, .kind = Rewrite::Kind::divideFloat, .factor = 100.0F};
}
constexpr Rewrite bandwidthMhz(Name key) { return {.key = key, .kind = Rewrite::Kind::bandwidth}; }

inline constexpr std::array kUtraRewrites = {rscpDbm("rscp"), ecnoDb("ecno")};
inline constexpr std::array kGeranRewrites = {rxlevDbm("rxlev")};
inline constexpr std::array kEutraRewrites = {rsrpDbm("rsrp"), rsrqDb("rsrq")};
inline constexpr std::array kEutraNbrRewrites = {rsrpDbm("nbr_rsrp"), rsrqDb("nbr_rsrq")};
inline constexpr std::array kCpichRewrites = {rscpDbm("cpich_rscp"), ecnoDb("cpich_ecno")};
inline constexpr std::array kSinrRewrites = {halfDb("sinr0"), halfDb("sinr1")};
inline constexpr std::array kCarrierRewrites = {wholeOfHundredths("rsrp"),
                                                wholeOfHundredths("rssi"), hundredths("rsrq"),
                                                bandwidthMhz("dl_bandwidth")};
inline constexpr std::array kNeighbourBandwidth = {bandwidthMhz("dl_bw")};
inline constexpr std::array kBandList = {
    Rewrite{.key = "multi_band_info", .kind = Rewrite::Kind::integerListText}};
inline constexpr std::array kTrackingAreaList = {
    Rewrite{.key = "tai_list", .kind = Rewrite::Kind::listText}};

inline constexpr std::array<Name, 1> kTime = {"timestamp"};
inline constexpr std::array<Name, 2> kModeAndTime = {"connected_mode", "timestamp"};

template <auto record, auto list>
EntryList& in(MetricStore& store) {
  return store.*record.*list;
}
using Store = MetricStore;

constexpr ListCopy copy(Name key, EntryList& (*target)(MetricStore&),
                        std::span<const Rewrite> rewrites = {},
                        std::span<const Name> carried = kTime) {
  return {key, target, rewrites, carried};
}

inline constexpr std::array kLteTxPowerCopies = {
    copy("tx_power_info", in<&Store::myLTE, &LTE::TxPower>)};
inline constexpr std::array kLteSignalCopies = {
    copy("inst_values", in<&Store::myLTE, &LTE::RsrpRsrqSinr>, kSinrRewrites)};
inline constexpr std::array kLteNeighbourCopies = {
    copy("meas_nbr_eutra", in<&Store::myLTE, &LTE::EutraNbrsMeas>, kEutraNbrRewrites)};
inline constexpr std::array kLteInterRatCopies = {
    copy("meas_nbr_utra", in<&Store::myLTE, &LTE::UtraNbrsMeas>, kUtraRewrites),
    copy("meas_nbr_geran", in<&Store::myLTE, &LTE::GeraNbrsMeas>, kGeranRewrites)};
inline constexpr std::array kCarrierCopies = {
    copy("scc_list", in<&Store::myLTE, &LTE::CAStatusList>, kCarrierRewrites)};
inline constexpr std::array kLteReselectionCopies = {
    copy("nbr_eutra", in<&Store::myLTE, &LTE::EutraNbrs>, kNeighbourBandwidth)};
inline constexpr std::array kUmtsMeasurementCopies = {
    copy("rx_info", in<&Store::myUMTS, &UMTS::rXInfo>, {}, kModeAndTime)};
inline constexpr std::array kUmtsTxPowerCopies = {
    copy("tx_power_info", in<&Store::myUMTS, &UMTS::TxPower>)};
inline constexpr std::array kUmtsNeighbourCopies = {
    copy("meas_utra_result", in<&Store::myUMTS, &UMTS::utraNbrMeas>, kUtraRewrites),
    copy("meas_gsm_result", in<&Store::myUMTS, &UMTS::geraNbrMeas>, kGeranRewrites),
    copy("meas_lte_result", in<&Store::myUMTS, &UMTS::eUtraNbrMeas>, kEutraRewrites)};
inline constexpr std::array kUmtsReselectionCopies = {
    copy("eutra_prio_info", in<&Store::myUMTS, &UMTS::eUtraNbrs>),
    copy("utra_prio_info", in<&Store::myUMTS, &UMTS::utraNbrs>),
    copy("gsm_prio_info", in<&Store::myUMTS, &UMTS::geraNbrs>)};
inline constexpr std::array kGsmNeighbourCopies = {
    copy("gsm_ncell_meas", in<&Store::myGSM, &GSM::geraNbrMeas>, kGeranRewrites),
    copy("umts_ncell_meas", in<&Store::myGSM, &GSM::utraNbrMeas>, kCpichRewrites),
    copy("lte_ncell_meas", in<&Store::myGSM, &GSM::eUtraNbrMeas>, kEutraRewrites)};
inline constexpr std::array kBearerCopies = {
    copy("bearer_contexts", in<&Store::myCommon, &Common::activeBearer>)};
inline constexpr std::array kSimCopies = {
    copy("ef_list", in<&Store::myCommon, &Common::simContents>)};

inline Dictionary& lteReselection(MetricStore& store) { return store.myLTE.SelReselCellInfo; }
inline Dictionary& umtsReselection(MetricStore& store) { return store.myUMTS.SelReselCellInfo; }

inline constexpr Derivation kNone = {};
inline constexpr Derivation kLteServingCell = {.inPlace = kNeighbourBandwidth};
inline constexpr Derivation kLteReselection = {
    .inPlace = kBandList, .projection = lteReselection, .copies = kLteReselectionCopies};
inline constexpr Derivation kLteTxPower = {.copies = kLteTxPowerCopies};
inline constexpr Derivation kLteSignal = {.copies = kLteSignalCopies};
inline constexpr Derivation kLteCarrierAggregation = {.copies = kCarrierCopies};
inline constexpr Derivation kLteInterRatNeighbours = {.copies = kLteInterRatCopies};
inline constexpr Derivation kLteNeighbours = {.copies = kLteNeighbourCopies};
inline constexpr Derivation kEmmContext = {.inPlace = kTrackingAreaList};
inline constexpr Derivation kActiveBearers = {.copies = kBearerCopies};
inline constexpr Derivation kUmtsServingCellMeasurement = {.copies = kUmtsMeasurementCopies};
inline constexpr Derivation kUmtsTxPower = {.copies = kUmtsTxPowerCopies};
inline constexpr Derivation kUmtsReselection = {
    .inPlace = kBandList, .projection = umtsReselection, .copies = kUmtsReselectionCopies};
inline constexpr Derivation kUmtsNeighbours = {.copies = kUmtsNeighbourCopies};
inline constexpr Derivation kGsmNeighbours = {.copies = kGsmNeighbourCopies};
inline constexpr Derivation kSimFiles = {.copies = kSimCopies};

}  // namespace qel::derivations
