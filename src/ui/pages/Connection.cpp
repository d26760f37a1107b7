#include "ui/pages/Connection.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace qel {
namespace {

struct StateWord {
  std::string_view state;
  std::string_view word;
};

// A state that says that the phone is not there has no word.
constexpr std::array kStates = {
    StateWord{"KLTE_RRC_STATE_IDLE", "idle"},
    StateWord{"KLTE_RRC_STATE_ATMPT_CONNECTION", "connecting"},
    StateWord{"KLTE_RRC_STATE_CONNECTED", "connected"},
    StateWord{"KLTE_RRC_STATE_ENDING", "releasing"},
    StateWord{"KLTE_RRC_STATE_ATMPT_OUTBND_MOBILITY", "leaving LTE"},
    StateWord{"KLTE_RRC_STATE_ATMPT_INBND_MOBILITY", "coming to LTE"},
    StateWord{"KWCDMA_RRC_CONN_STATE_IDLE", "idle"},
    StateWord{"KWCDMA_RRC_CONN_STATE_ESTABLISH", "connecting"},
    StateWord{"KWCDMA_RRC_CONN_STATE_URA_PCH", "URA_PCH"},
    StateWord{"KWCDMA_RRC_CONN_STATE_CELL_PCH", "CELL_PCH"},
    StateWord{"KWCDMA_RRC_CONN_STATE_CELL_FACH", "CELL_FACH"},
    StateWord{"KWCDMA_RRC_CONN_STATE_CELL_DCH", "CELL_DCH"},
    StateWord{"KWCDMA_RRC_CONN_STATE_RELEASE", "releasing"},
    StateWord{"KWCDMA_RRC_CONN_STATE_RADIO_LINK_FAILURE", "radio link failed"},
    StateWord{"KWCDMA_RRC_CONN_STATE_SCRI_SENT", "releasing"},
    StateWord{"DEDICATED_STATE", "dedicated"},
    StateWord{"NON_DEDICATED_STATE", "idle"},
};

const MetricStore::Slot& stateSlot(const MetricStore& store, Technology technology) {
  switch (technology) {
    case Technology::lte:
      return store.myLTERRCStateDict;
    case Technology::umts:
      return store.myUMTSRRCStateDict;
    case Technology::gsm:
      return store.myGSMScellInfoDict;
  }
  return store.myLTERRCStateDict;
}

const Value* fieldOf(const MetricStore::Slot& slot, std::string_view key) {
  return slot ? slot->find(key) : nullptr;
}

std::string_view textOf(const Value* value) {
  return value ? value->asText().value_or("") : std::string_view();
}

bool saysChannel(const Value* value, std::uint32_t channel) {
  return value && value->asUInt64() == channel;
}

// "VIII" of "SYS_BAND_WCDMA_VIII_900".
std::string umtsBand(std::string_view name) {
  constexpr std::string_view kBeginning = "SYS_BAND_WCDMA_";
  if (!name.starts_with(kBeginning)) return {};
  name.remove_prefix(kBeginning.size());
  return std::string(name.substr(0, name.find('_')));
}

// "DCS 1800" of "SYS_BAND_GSM_DCS_1800"; the kinds of 900 MHz are one band to a reader.
std::string gsmBand(std::string_view name) {
  constexpr std::string_view kBeginning = "SYS_BAND_GSM_";
  if (!name.starts_with(kBeginning)) return {};
  name.remove_prefix(kBeginning.size());
  const auto blank = name.find('_');
  if (blank == std::string_view::npos || name.substr(1, 4) == "GSM_") {
    return "GSM " + std::string(name.substr(blank == std::string_view::npos ? 0 : blank + 1));
  }
  return std::string(name.substr(0, blank)) + " " + std::string(name.substr(blank + 1));
}

bool isConfigured(const Value& carrier) {
  const Dictionary* entry = carrier.asDictionary();
  if (!entry) return false;
  const std::string_view state = textOf(entry->find("state"));
  return state == "SCC_STATE_CONFIGURED_DEACTIVATED" || state == "SCC_STATE_ACTIVATED";
}

}  // namespace

std::string connectionWord(const MetricStore& store, Technology technology) {
  const std::string_view state = textOf(fieldOf(stateSlot(store, technology), "state"));
  const auto* found = std::ranges::find(kStates, state, &StateWord::state);
  return found == kStates.end() ? std::string() : std::string(found->word);
}

std::optional<unsigned> carrierCount(const MetricStore& store, Technology technology) {
  if (technology == Technology::umts) {
    const Value* dual = fieldOf(store.myUMTSRRCConfigDict, "is_dc_configured");
    const auto isDual = dual ? dual->asBoolean() : std::nullopt;
    if (!isDual) return std::nullopt;
    return *isDual ? 2 : 1;
  }
  if (technology != Technology::lte || !store.myLTECAStatusDict) return std::nullopt;
  const Value* list = fieldOf(store.myLTECAStatusDict, "scc_list");
  const List* carriers = list ? list->asList() : nullptr;
  if (!carriers) return 1;
  return 1 + static_cast<unsigned>(std::count_if(carriers->begin(), carriers->end(), isConfigured));
}

std::string reportedBand(const MetricStore& store, Technology technology, std::uint32_t channel) {
  switch (technology) {
    case Technology::lte: {
      const auto& cell = store.myLTESCellInfoDict;
      const Value* band = fieldOf(cell, "freq_band_ind");
      const auto number = band ? band->asUInt64() : std::nullopt;
      const bool isThis = saysChannel(fieldOf(cell, "dl_freq"), channel);
      return isThis && number && *number > 0 ? std::to_string(*number) : std::string();
    }
    case Technology::umts: {
      const auto& cell = store.myUMTSCellInfoDict;
      const bool isThis = saysChannel(fieldOf(cell, "dl_uarfcn"), channel);
      return isThis ? umtsBand(textOf(fieldOf(cell, "wcdma_band"))) : std::string();
    }
    case Technology::gsm: {
      const auto& cell = store.myGSMScellInfoDict;
      const bool isThis = saysChannel(fieldOf(cell, "arfcn"), channel);
      return isThis ? gsmBand(textOf(fieldOf(cell, "gsm_band"))) : std::string();
    }
  }
  return {};
}

}  // namespace qel
