#include "metrics/MetricStore.h"

#include <initializer_list>

namespace qel {
namespace {

Dictionary emptyTexts(std::initializer_list<Name> keys) {
  Dictionary record;
  record.reserve(keys.size());
  for (const Name key : keys) record.append(key, Text());
  return record;
}

}  // namespace

EntryList placeholderList() {
  constexpr Name kWaiting = "Waiting for Update";
  return {Dictionary{{kWaiting, kWaiting}}};
}

LTE::LTE()
    : SelReselCellInfo(
          emptyTexts({"timestamp", "ims_emergency_support", "ac_barring_for_emergency",
                      "mo_signalling_ac_barring_factor", "mo_signalling_ac_barring_time",
                      "mo_signalling_ac_barring_for_special_ac", "mo_data_ac_barring_factor",
                      "mo_data_ac_barring_time", "mo_data_ac_barring_for_special_ac", "QRxLevMin",
                      "QQualMin", "S_non_intra_search_P", "S_non_intra_search_Q",
                      "S_intra_search_P", "S_intra_search_Q", "Thresh_serving_lowP",
                      "Thresh_serving_lowQ", "priority_operating_freq", "multi_band_info"})) {}

UMTS::UMTS()
    : SelReselCellInfo(emptyTexts(
          {"timestamp", "ims_emergency_support", "hsdpa_capable", "edch_capable", "duplex_mode",
           "cell_barred", "fach_meas_occ_info_present", "s_rxlev", "s_qual", "s_intrasearch",
           "s_intersearch", "s_search_rat", "s_cell_prio", "multi_band_info"})) {}

}  // namespace qel
