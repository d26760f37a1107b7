#include "history/Words.h"

#include <algorithm>
#include <array>

#include "base/Rendering.h"

namespace qel {
namespace {

constexpr auto kWords = [] {
  std::array rows = {
      // 36.331, clause 4.2.1, and the modem's steps between.
      NamedWords{"KLTE_RRC_STATE_NULL", "not on LTE"},
      NamedWords{"KLTE_RRC_STATE_IDLE", "idle"},
      NamedWords{"KLTE_RRC_STATE_ATMPT_CONNECTION", "asking for a connection"},
      NamedWords{"KLTE_RRC_STATE_CONNECTED", "connected"},
      NamedWords{"KLTE_RRC_STATE_ENDING", "releasing the connection"},
      NamedWords{"KLTE_RRC_STATE_ATMPT_OUTBND_MOBILITY", "leaving LTE for another technology"},
      NamedWords{"KLTE_RRC_STATE_ATMPT_INBND_MOBILITY", "coming to LTE from another technology"},

      NamedWords{"KLTE_RRC_CAUSE_EST_EMERGENCY", "emergency"},
      NamedWords{"KLTE_RRC_CAUSE_EST_HIGH_PRIO_ACC", "access of high priority"},
      NamedWords{"KLTE_RRC_CAUSE_EST_MT_ACC", "answer to a page"},
      NamedWords{"KLTE_RRC_CAUSE_EST_MO_SIGNAL", "signalling from the phone"},
      NamedWords{"KLTE_RRC_CAUSE_EST_MO_DATA", "data from the phone"},
      NamedWords{"KLTE_RRC_CAUSE_EST_DELAY_TOL_ACC", "access that may wait"},
      NamedWords{"KLTE_RRC_CAUSE_REEST_RECFG_FAIL",
                 "again after a reconfiguration that could not be followed"},
      NamedWords{"KLTE_RRC_CAUSE_REEST_HO_FAIL", "again after a failed handover"},
      NamedWords{"KLTE_RRC_CAUSE_REEST_OTHER_FAIL", "again after another failure"},
      NamedWords{"KLTE_RRC_CAUSE_REL_OTHER_RECFG_FAIL", "a reconfiguration failed"},
      NamedWords{"KLTE_RRC_CAUSE_REL_CONN_FAIL_IRAT_RESEL", "reselected to another technology"},
      NamedWords{"KLTE_RRC_CAUSE_REL_CONN_FAIL_T311_EXP", "no suitable cell before T311 ended"},
      NamedWords{"KLTE_RRC_CAUSE_REL_CONN_FAIL_CELL_NOT_SUIT",
                 "the chosen cell stopped being suitable"},
      NamedWords{"KLTE_RRC_CAUSE_REL_CONN_FAIL_REEST_REJ", "asked for again and rejected"},
      NamedWords{"KLTE_RRC_CAUSE_REL_LOAD_BAL_TAU_REQD", "load balancing by tracking area update"},
      NamedWords{"KLTE_RRC_CAUSE_REL_OTHER", "the network's cause \"other\""},
      NamedWords{"KLTE_RRC_CAUSE_REL_CSFB_HIGH_PRIO", "urgent circuit-switched fallback"},
      NamedWords{"KLTE_RRC_CAUSE_REL_T310_EXP", "out of sync, T310 ended"},
      NamedWords{"KLTE_RRC_CAUSE_REL_RND_ACC", "random access problem"},
      NamedWords{"KLTE_RRC_CAUSE_REL_MAX_RLC_RETRANS", "most RLC retransmissions made"},
      NamedWords{"KLTE_RRC_CAUSE_REL_SUCC_MOB_FROM_EUTRAN", "moved to another technology"},
      NamedWords{"KLTE_RRC_CAUSE_EST_SUCC_MOB_TO_EUTRAN", "moved here from another technology"},
      NamedWords{"KLTE_RRC_CAUSE_EST_FAIL_NO_RESP_FROM_CELL", "the cell did not answer"},
      NamedWords{"KLTE_RRC_CAUSE_EST_FAIL_REJ", "the cell rejected the request"},
      NamedWords{"KLTE_RRC_CAUSE_EST_FAIL_CELL_RESEL", "reselected to another cell meanwhile"},
      NamedWords{"KLTE_RRC_CAUSE_EST_FAIL_ABORTED", "given up by the upper layers"},
      NamedWords{"KLTE_RRC_CAUSE_EST_FAIL_CELL_BARRED", "access to the cell is barred"},
      NamedWords{"KLTE_RRC_CAUSE_REEST_OTHER_FAIL_T310_EXP",
                 "again after losing sync (T310 ended)"},
      NamedWords{"KLTE_RRC_CAUSE_REEST_OTHER_FAIL_RND_ACC", "again after a random access problem"},
      NamedWords{"KLTE_RRC_CAUSE_REEST_OTHER_FAIL_MAX_RLC_RETX",
                 "again after the most RLC retransmissions"},
      NamedWords{"KLTE_RRC_CAUSE_REEST_OTHER_FAIL_INTEG_CHECK",
                 "again after a failed integrity check"},
      NamedWords{"KLTE_RRC_CAUSE_NO_SERVICE", "service was lost"},
      NamedWords{"KLTE_RRC_CAUSE_NA", ""},

      // 25.331, clauses 7.1, 10.3.3.11 and 10.3.3.32.
      NamedWords{"KWCDMA_RRC_CONN_STATE_INVALID", "not known"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_INACTIVE", "not on UMTS"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_IDLE", "idle"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_ESTABLISH", "asking for a connection"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_URA_PCH", "connected, paged in its area (URA_PCH)"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_CELL_PCH", "connected, paged in its cell (CELL_PCH)"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_CELL_FACH", "connected on shared channels (CELL_FACH)"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_CELL_DCH", "connected on a dedicated channel (CELL_DCH)"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_RELEASE", "releasing the connection"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_RADIO_LINK_FAILURE", "radio link failure"},
      NamedWords{"KWCDMA_RRC_CONN_STATE_SCRI_SENT", "asked to end the signalling connection"},

      NamedWords{"KRRC_EST_ORIG_CONV_CALL", "conversation, from the phone"},
      NamedWords{"KRRC_EST_ORIG_STREAM_CALL", "streaming, from the phone"},
      NamedWords{"KRRC_EST_ORIG_INTERACT_CALL", "interactive data, from the phone"},
      NamedWords{"KRRC_EST_ORIG_BACKGND_CALL", "background data, from the phone"},
      NamedWords{"KRRC_EST_ORIG_SUBSCRIBED_TRF_CALL", "subscribed traffic, from the phone"},
      NamedWords{"KRRC_EST_TERM_CONV_CALL", "conversation, from the network"},
      NamedWords{"KRRC_EST_TERM_STREAM_CALL", "streaming, from the network"},
      NamedWords{"KRRC_EST_TERM_INTERACT_CALL", "interactive data, from the network"},
      NamedWords{"KRRC_EST_TERM_BACKGND_CALL", "background data, from the network"},
      NamedWords{"KRRC_EST_EMERGENCY_CALL", "emergency call"},
      NamedWords{"KRRC_EST_INTER_RAT_CELL_RESELECT", "reselected from another technology"},
      NamedWords{"KRRC_EST_INTER_RAT_CELL_CHANGE_ORDER", "ordered here from another technology"},
      NamedWords{"KRRC_EST_REGISTRATION", "registration"},
      NamedWords{"KRRC_EST_DETACH", "detach"},
      NamedWords{"KRRC_EST_HI_PRI_SIGNALLING", "urgent signalling from the phone"},
      NamedWords{"KRRC_EST_LOW_PRI_SIGNALLING", "signalling from the phone"},
      NamedWords{"KRRC_EST_CALL_RE_ESTABLISH", "a call that broke off"},
      NamedWords{"KRRC_EST_TERM_HI_SIGNALLING", "urgent signalling from the network"},
      NamedWords{"KRRC_EST_TERM_LOW_SIGNALLING", "signalling from the network"},
      NamedWords{"KRRC_EST_TERM_UNKNOWN", "the network gave no cause"},
      NamedWords{"KRRC_EST_MBMS_RECEPTION", "broadcast reception"},
      NamedWords{"KRRC_EST_MBMS_PTP_RB_REQUEST", "bearer for a broadcast service"},
      NamedWords{"KRRC_EST_DELAY_TOLERANT_ACCESS", "access that may wait"},

      NamedWords{"KRRC_REL_OTHER_CAUSE", "another cause"},
      NamedWords{"KRRC_REL_NO_CAUSE", "no cause was given"},
      NamedWords{"KRRC_REL_NO_CELL", "no cell was found"},
      NamedWords{"KRRC_REL_INACTIVE", "nothing was sent"},
      NamedWords{"KRRC_REL_NORMAL_EVENT", "normal end"},
      NamedWords{"KRRC_REL_CELL_BARRED", "the cell is barred"},
      NamedWords{"KRRC_REL_CELL_CHANGED", "the cell changed"},
      NamedWords{"KRRC_REL_ACCESS_NOT_ALLOWED", "access is not allowed"},
      NamedWords{"KRRC_REL_RRC_CONN_ESTABLISHMENT_FAILURE", "it could not be set up"},
      NamedWords{"KRRC_REL_RELEASE_OOSA", "out of the service area"},
      NamedWords{"KRRC_REL_SIGN_CONN_REL", "the signalling connection was released"},
      NamedWords{"KRRC_REL_CONN_REJECT_REDIRECTION", "rejected, sent elsewhere"},
      NamedWords{"KRRC_REL_NAS_TRIGGERED_ABORT", "given up by the upper layers"},
      NamedWords{"KRRC_REL_CONN_REL_LOWER_LAYER_FAILURE_DL", "the downlink failed"},
      NamedWords{"KRRC_REL_CONN_REL_LOWER_LAYER_FAILURE_UL", "the uplink failed"},
      NamedWords{"KRRC_REL_HO_FROM_UTRAN_REVERT_BACK_SYNC_FAIL",
                 "the handover to another technology and the way back failed"},
      NamedWords{"KRRC_REL_CONN_REJECT_CONGESTION", "rejected for congestion"},
      NamedWords{"KRRC_REL_CONN_REJECT_UNSPECIFIED", "rejected without a reason"},

      NamedWords{"KREG_STATUS_NORMAL_SERVICE", "registered, all services"},
      NamedWords{"KREG_STATUS_REGISTRATION_FAILURE", "registration failed"},
      NamedWords{"KREG_STATUS_LIMITED_SERVICE", "emergency calls only"},
      NamedWords{"KREG_STATUS_NO_SERVICE", "no service"},
      NamedWords{"KREG_STATUS_AT_NOT_REGISTERED", "not registered yet"},
      NamedWords{"KREG_STATUS_REGISTRATION_SERVICE_DISABLED", "switched off"},
      NamedWords{"KREG_STATUS_SERVICE_DETACHED", "detached"},
      NamedWords{"KREG_STATUS_SERVICE_ACTIVATED", "service activated"},
      NamedWords{"KREG_STATUS_EMERGENCY_SERVICE", "registered for emergency service"},
      NamedWords{"KREG_STATUS_EMERGENCY_LIMITED", "emergency calls, without registration"},
      NamedWords{"KREG_STATUS_REGISTERED_SMS_ONLY", "registered, for SMS only"},
      NamedWords{"KREG_STATUS_REGISTRATION_IN_PROGRESS", "registering"},
      NamedWords{"KREG_STATUS_POWER_OFF_NO_SERVICE", "no service, powering off"},

      NamedWords{"PDP_TYPE_IPv4", "IPv4"},
      NamedWords{"PDP_TYPE_IPv6", "IPv6"},
      NamedWords{"PDP_TYPE_IPv4v6", "IPv4 and IPv6"},
      NamedWords{"PDP_TYPE_IPv4_PDN", "IPv4"},
      NamedWords{"PDP_TYPE_IPv6_PDN", "IPv6"},
      NamedWords{"PDP_TYPE_IPv4v6_PDN", "IPv4 and IPv6"},
      NamedWords{"PDP_TYPE_PPP", "PPP"},
      NamedWords{"PDP_TYPE_NONE", "no address"},
  };
  std::ranges::sort(rows, {}, &NamedWords::name);
  return rows;
}();

static_assert(std::ranges::adjacent_find(kWords, {}, &NamedWords::name) == kWords.end());

const NamedWords* findIn(std::span<const NamedWords> sorted, std::string_view name) {
  const auto found = std::ranges::lower_bound(sorted, name, {}, &NamedWords::name);
  return found != sorted.end() && found->name == name ? &*found : nullptr;
}

}  // namespace

const NamedWords* wordsFor(std::string_view name) {
  const NamedWords* words = findIn(kWords, name);
  return words ? words : findIn(registrationWords(), name);
}

std::string_view numberWithoutName(std::string_view text) {
  constexpr std::string_view kStart = "(unknown: ";
  if (!text.starts_with(kStart) || !text.ends_with(')')) return {};
  return text.substr(kStart.size(), text.size() - kStart.size() - 1);
}

std::string wordsOf(const Value* value, std::string_view what) {
  if (!value) return {};
  const auto name = value->asText();
  if (!name) return std::string(what) + ' ' + cellText(*value);
  if (const NamedWords* words = wordsFor(*name)) return std::string(words->words);
  const std::string_view number = numberWithoutName(*name);
  return number.empty() ? std::string(*name) : std::string(what) + ' ' + std::string(number);
}

}  // namespace qel
