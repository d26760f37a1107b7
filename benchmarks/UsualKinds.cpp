// The shares are those of public measurements of phones on LTE, UMTS and GSM, rounded: three
// recordings, for transmit power and reselection raw logs of diagnostics ports as well. Places and
// identities are made up: the network is the test network 001 01, texts and bytes have a length and
// no content.

#include "UsualKinds.h"

#include <array>

namespace qel::bench {
namespace {

constexpr std::int64_t kMccOfTests = 1;
constexpr std::int64_t kMncOfTests = 1;
constexpr std::int64_t kLastArea = 65535;
constexpr std::int64_t kLastEci = (1 << 28) - 1;
constexpr std::int64_t kFirstTmsi = 0xC0000000;
constexpr std::int64_t kLastTmsi = 0xFFFFFFFF;

constexpr FieldShare kServing[] = {
    {"is_connected_mode", 77, 99, 0, 1},    {"rx_info", 100, 0, 2, 2},
    {"rx_info.rssi", 99, 43, -92, -69},     {"rx_info.rsrp_range", 100, 75, 12, 41},
    {"rx_info.rsrq_range", 100, 31, 0, 24}, {"rx_info.snr", 99, 33, -6, 10},
};

constexpr FieldShare kTxPower[] = {
    {"tx_power_info", 100, 0, 1, 6},
    {"tx_power_info.pucch_tx_power", 51, 20, -5, 1},
    {"tx_power_info.pusch_tx_power", 49, 30, 14, 22},
    {"tx_power_info.subframe_index", 100, 10, 1, 8},
};

constexpr FieldShare kRrcState[] = {
    {"state", 100, 1, 1, 3},
    {"prev_state", 100, 1, 1, 3},
    {"prev_state_dur_ms", 98, 0, 60, 257250},
    {"cause", 100, 35, 2, 15},
};

constexpr FieldShare kNeighbours[] = {
    {"meas_nbr_eutra", 100, 0, 1, 4},
    {"meas_nbr_eutra.nbr_earfcn", 97, 99, 600, 41000},
    {"meas_nbr_eutra.nbr_phys_cell_id", 100, 98, 0, 503},
    {"meas_nbr_eutra.freq_band_ind", 97, 99, 1, 41},
    {"meas_nbr_eutra.nbr_rsrp", 100, 77, 4, 50},
    {"meas_nbr_eutra.nbr_rsrq", 100, 75, 0, 29},
};

constexpr FieldShare kEmmContext[] = {
    {"reg_status", 95, 93, 0, 11},
    {"update_status", 87, 98, 0, 1},
    {"ue_op_mode", 88, 100, 2, 2},
    {"tai_list", 87, 0, 1, 1},
    {"tai_list.encoded_plmn", 100, 0, 3, 3},
    {"tai_list.tac", 100, 100, 1, kLastArea},
    {"guti", 96, 0, 1, 1},
    {"guti.mmegi", 100, 100, 0, 65535},
    {"guti.mmec", 100, 100, 0, 255},
    {"guti.m_tmsi", 100, 99, kFirstTmsi, kLastTmsi},
    {"reject_cause", 87, 98, 0, 10},
    {"reg_proc", 99, 60, 0, 7},
    {"t3412_dur_s", 87, 100, 1320, 1320},
    {"is_ims_voice_supported", 2, 100, 1, 1},
    {"is_emerg_bearer_supported", 2, 100, 0, 0},
};

constexpr FieldShare kCarrierAggregation[] = {
    {"scc_list", 100, 0, 1, 1},
    {"scc_list.index", 100, 100, 1, 1},
    {"scc_list.state", 2, 0, 0, 0},
    {"scc_list.pci", 100, 100, 0, 503},
    {"scc_list.dl_earfcn", 100, 100, 600, 1199},
    {"scc_list.dl_rf_band", 100, 100, 2, 2},
    {"scc_list.rsrp", 98, 56, -10731, -10669},
    {"scc_list.rsrq", 98, 3, -975, -738},
    {"scc_list.snr", 98, 1, 540, 910},
    {"scc_list.rssi", 98, 6, -8275, -7756},
};

constexpr FieldShare kCdrx[] = {
    {"on_duration_ms", 100, 100, 8, 8},      {"drx_inactivity_ms", 100, 100, 60, 60},
    {"drx_retx_timer_ms", 100, 100, 4, 4},   {"long_drx_cycle_ms", 100, 100, 160, 160},
    {"short_drx_cycle_ms", 98, 100, 20, 20}, {"drx_short_cycle_num", 98, 100, 2, 2},
    {"rrc_state", 100, 100, 3, 3},           {"transmission_mode", 58, 33, 3, 8},
};

constexpr FieldShare kUmtsNeighbours[] = {
    {"meas_utra_result", 100, 0, 1, 1},        {"meas_utra_result.uarfcn", 1, 0, 10562, 10838},
    {"meas_utra_result.psc", 100, 99, 0, 511}, {"meas_utra_result.ecno", 100, 39, 36, 43},
    {"meas_utra_result.rscp", 96, 52, 19, 42},
};

constexpr FieldShare kReselection[] = {
    {"multi_band_info", 62, 87, 1, 1},
    {"ims_emergency_support", 80, 100, 0, 1},
    {"ac_barring_for_emergency", 67, 100, 0, 0},
    {"QRxLevMin", 100, 87, -130, -120},
    {"QQualMin", 73, 96, -34, -19},
    {"Q_hyst", 60, 99, 2, 4},
    {"S_non_intra_search_P", 60, 96, 6, 50},
    {"S_non_intra_search_Q", 21, 91, 0, 14},
    {"S_intra_search_P", 51, 96, 24, 62},
    {"S_intra_search_Q", 21, 93, 4, 31},
    {"Thresh_serving_lowP", 60, 96, 0, 6},
    {"priority_operating_freq", 60, 96, 2, 6},
    {"nbr_eutra", 38, 0, 2, 8},
    {"nbr_eutra.earfcn", 100, 94, 1025, 41134},
    {"nbr_eutra.Q_rxlev_min", 100, 97, -128, -120},
    {"nbr_eutra.Q_qual_min", 24, 100, -30, -19},
    {"nbr_eutra.Q_offset", 83, 100, 0, 0},
    {"nbr_eutra.Pmax", 94, 100, 23, 23},
    {"nbr_eutra.dl_bw", 100, 97, 0, 5},
    {"nbr_eutra.Thres_X_highP", 100, 99, 6, 24},
    {"nbr_eutra.Thres_X_lowP", 100, 99, 6, 18},
    {"nbr_eutra.Thres_X_highQ", 24, 100, 5, 14},
    {"nbr_eutra.Thres_X_lowQ", 24, 100, 6, 14},
    {"nbr_eutra.priority", 100, 97, 1, 6},
    {"nbr_eutra.frame_type", 100, 99, 0, 1},
    {"nbr_eutra.band", 100, 97, 2, 41},
};

constexpr FieldShare kGmmContext[] = {
    {"reg_status", 91, 84, 0, 11},
    {"update_status", 99, 97, 0, 2},
    {"rai", 82, 0, 1, 1},
    {"rai.encoded_plmn", 100, 0, 3, 3},
    {"rai.lac", 100, 97, 1, kLastArea},
    {"rai.rac", 100, 97, 1, 100},
    {"p_tmsi", 13, 80, kFirstTmsi, kLastTmsi},
    {"t3312_dur_s", 10, 100, 1200, 1320},
    {"reject_cause", 13, 100, 0, 0},
    {"reg_proc", 73, 94, 2, 10},
};

constexpr FieldShare kMmContext[] = {
    {"reg_status", 86, 70, 0, 11},
    {"update_status", 99, 96, 1, 1},
    {"lai", 82, 0, 1, 1},
    {"lai.encoded_plmn", 100, 0, 3, 3},
    {"lai.lac", 100, 97, 1, kLastArea},
    {"tmsi", 78, 89, kFirstTmsi, kLastTmsi},
    {"t3212_dur_s", 84, 97, 3600, 10800},
    {"reject_cause", 78, 100, 0, 0},
};

constexpr FieldShare kServingCell[] = {
    {"phy_cell_id", 100, 56, 0, 503},
    {"dl_freq", 100, 76, 5000, 38249},
    {"ul_freq", 100, 76, 23000, 38249},
    {"dl_bw", 100, 97, 4, 5},
    {"ul_bw", 100, 97, 4, 5},
    {"cell_id", 100, 56, 0, kLastEci},
    {"freq_band_ind", 100, 97, 17, 38},
    {"tracking_area_code", 100, 97, 1, kLastArea},
    {"num_mnc_digits", 100, 100, 2, 2},
    {"sel_plmn_mcc", 100, 100, kMccOfTests, kMccOfTests},
    {"sel_plmn_mnc", 100, 97, kMncOfTests, kMncOfTests},
    {"tdd_sf_assignment", 94, 100, 2, 2},
    {"tdd_ssf_patterns", 94, 100, 7, 7},
};

constexpr FieldShare kGsmServingCell[] = {
    {"mcc", 100, 100, kMccOfTests, kMccOfTests},
    {"mnc", 100, 96, kMncOfTests, kMncOfTests},
    {"lac", 100, 93, 1, kLastArea},
    {"cell_id", 100, 63, 1, 65535},
    {"state", 100, 84, 1, 2},
    {"num_mnc_digits", 100, 100, 2, 2},
};

// Without "cr_offset", whose number is a metric's: it would never be read.
constexpr FieldShare kGsmIdle[] = {
    {"mcc", 100, 100, kMccOfTests, kMccOfTests},
    {"mnc", 100, 96, kMncOfTests, kMncOfTests},
    {"lac", 100, 91, 1, kLastArea},
    {"ci", 100, 58, 1, 65535},
    {"dtx_from_bs", 100, 100, 1, 1},
    {"radio_link_timeout", 100, 96, 6, 7},
    {"ms_txpwr", 100, 82, 0, 5},
    {"rx_acc_min", 100, 87, 5, 16},
    {"cbq", 100, 100, 0, 0},
    {"cba", 100, 100, 0, 0},
    {"c2_valid", 100, 100, 1, 1},
    {"tmp_offset", 100, 100, 0, 0},
    {"penalty_t", 100, 100, 0, 0},
    {"t3212", 100, 96, 19, 30},
    {"acc", 100, 100, 0, 0},
    {"bs_pa_mfrms", 100, 84, 2, 5},
    {"max_retrans_cs", 100, 100, 2, 2},
    {"emerg_call_allowed", 100, 100, 1, 1},
    {"attach_allowed", 100, 100, 1, 1},
    {"reest_allowed", 100, 100, 0, 1},
    {"ecsc", 100, 100, 1, 1},
    {"si_2_ter_needed", 100, 89, 0, 1},
};

constexpr FieldShare kUmtsReselection[] = {
    {"duplex_mode", 100, 100, 0, 0},          {"cell_barred", 100, 100, 0, 0},
    {"s_intrasearch", 100, 98, 14, 16},       {"s_intersearch", 100, 98, 14, 16},
    {"s_search_rat", 100, 100, 4, 4},         {"s_cell_prio", 98, 98, 2, 3},
    {"eutra_prio_info", 98, 0, 3, 3},         {"eutra_prio_info.earfcn", 100, 100, 1501, 6300},
    {"eutra_prio_info.prio", 100, 100, 5, 7},
};

constexpr FieldShare kUmtsRrcState[] = {
    {"state", 100, 46, 2, 8},
    {"establishment_cause", 76, 100, 0, 4},
    {"release_cause", 5, 0, 0, 0},
};

constexpr FieldShare kGsmNeighbours[] = {
    {"gsm_ncell_meas", 88, 0, 2, 6},          {"gsm_ncell_meas.bsic", 100, 69, 0, 63},
    {"gsm_ncell_meas.arfcn", 98, 63, 1, 124}, {"gsm_ncell_meas.rxlev", 100, 51, 9, 23},
    {"lte_ncell_meas", 12, 0, 1, 2},          {"lte_ncell_meas.physical_cell_id", 100, 25, 0, 503},
    {"lte_ncell_meas.rsrp", 100, 0, 8, 28},   {"lte_ncell_meas.earfcn", 100, 25, 37750, 40540},
    {"lte_ncell_meas.rsrq", 100, 75, 1, 17},
};

constexpr FieldShare kGsmCall[] = {
    {"cs_rxlev_sub", 100, 21, 29, 42},
    {"cs_rxqual_sub", 100, 83, 0, 0},
};

constexpr FieldShare kUmtsCell[] = {
    {"mcc", 95, 100, kMccOfTests, kMccOfTests},
    {"mnc", 95, 100, kMncOfTests, kMncOfTests},
    {"lac", 95, 100, 1, kLastArea},
    {"cell_id", 100, 83, 1, kLastEci},
    {"num_mnc_digits", 95, 100, 2, 2},
};

constexpr FieldShare kGprs[] = {
    {"gprs_sup", 100, 100, 1, 1}, {"rac", 100, 100, 0, 255},
    {"sp_pg_cy", 100, 100, 0, 0}, {"nco", 100, 100, 0, 0},
    {"nom", 100, 100, 2, 2},      {"cr_hyst", 100, 79, 4, 7},
    {"acc_thr", 100, 100, 6, 6},  {"ext_upl_tbf_supported", 100, 100, 0, 1},
};

constexpr FieldShare kMmCommon[] = {
    {"imsi", 92, 0, 9, 9},
    {"eplmn_list", 31, 0, 1, 3},
    {"eplmn_list.encoded_plmn", 100, 0, 3, 3},
};

constexpr FieldShare kSignalShort[] = {
    {"duration_ms", 100, 44, 0, 0},
    {"num_samples", 100, 41, 1, 1},
    {"avg_values", 100, 0, 1, 1},
    {"avg_values.phy_cell_id", 100, 100, 0, 503},
    {"avg_values.rsrp0", 100, 28, -119, -106},
    {"avg_values.rsrp1", 100, 41, -119, -107},
    {"avg_values.rsrq0", 100, 44, -11, -8},
    {"avg_values.rsrq1", 100, 47, -11, -8},
    {"avg_values.sinr0", 100, 19, 7, 17},
    {"avg_values.sinr1", 100, 25, 7, 17},
    {"inst_values", 100, 0, 1, 1},
    {"inst_values.phy_cell_id", 100, 100, 0, 503},
    {"inst_values.rsrp0", 100, 32, -118, -106},
    {"inst_values.rsrp1", 100, 37, -119, -108},
    {"inst_values.rsrq0", 100, 38, -11, -7},
    {"inst_values.rsrq1", 100, 42, -11, -8},
    {"inst_values.sinr0", 100, 16, 6, 18},
    {"inst_values.sinr1", 100, 21, 7, 16},
};

// Of up to a second.
constexpr auto kSignalLong = [] {
  auto shares = std::to_array(kSignalShort);
  for (FieldShare& share : shares) {
    if (share.field == "duration_ms") share.high = 990;
    if (share.field == "num_samples" || share.field == "inst_values") share.high = 100;
  }
  return shares;
}();

constexpr FieldShare kUmtsServing[] = {
    {"rx_info", 100, 0, 1, 1},
    {"rx_info.rssi", 100, 25, -70, -60},
    {"rx_info.rsrp_range", 36, 80, 38, 46},
    {"rx_info.rsrq_range", 36, 80, 18, 33},
};

constexpr FieldShare kUmtsTxPower[] = {
    {"tx_power_info", 100, 0, 1, 1},
    {"tx_power_info.pusch_tx_power", 100, 0, -11, -7},
};

constexpr FieldShare kCarriers[] = {
    {"pcc_earfcn", 100, 100, 5730, 5849},
    {"scc0_earfcn", 50, 0, 600, 1199},
};

constexpr FieldShare kUmtsConfiguration[] = {
    {"drx_cycle_length_ms", 100, 100, 640, 1280},
};

constexpr FieldShare kBearers[] = {
    {"bearer_context_count", 100, 100, 1, 1},
    {"bearer_contexts", 100, 0, 1, 1},
    {"bearer_contexts.nsapi", 100, 100, 5, 5},
    {"bearer_contexts.apn", 100, 0, 24, 24},
    {"bearer_contexts.pdp_type", 100, 100, 5, 5},
    {"bearer_contexts.pdp_addr", 100, 0, 12, 12},
    {"bearer_contexts.primary_dns_type", 100, 100, 0, 0},
    {"bearer_contexts.primary_dns_addr", 100, 0, 4, 4},
    {"bearer_contexts.secondary_dns_type", 100, 100, 1, 1},
    {"bearer_contexts.secondary_dns_addr", 100, 0, 16, 16},
};

constexpr KindShare kKinds[] = {
    {54017, 330, kServing},
    {54018, 100, kTxPower},
    {54031, 96, kNeighbours},
    {19972, 90, kRrcState},
    {54540, 50, kEmmContext},
    {54035, 40, kCarrierAggregation},
    {19992, 35, kCdrx},
    {53509, 35, kUmtsNeighbours},
    {54030, 30, kReselection},
    {54539, 30, kGmmContext},
    {54538, 28, kMmContext},
    {16578, 22, kServingCell},
    {11788, 20, kGsmServingCell},
    {53249, 16, kGsmIdle},
    {53508, 16, kUmtsReselection},
    {53522, 13, kUmtsRrcState},
    {53257, 11, kGsmNeighbours},
    {53251, 9, kGsmCall},
    {12300, 7, kUmtsCell},
    {53260, 6, kGprs},
    {54537, 4, kMmCommon},
    {20330, 2, kSignalShort},
    {20330, 2, kSignalLong},
    {53506, 3, kUmtsServing},
    {53507, 2, kUmtsTxPower},
    {54027, 1, kCarriers},
    {53523, 1, kUmtsConfiguration},
    {54541, 1, kBearers},
};

static_assert([] {
  unsigned sum = 0;
  for (const KindShare& kind : kKinds) sum += kind.perMille;
  return sum == 1000;
}());

}  // namespace

std::span<const KindShare> usualKinds() { return kKinds; }

}  // namespace qel::bench
