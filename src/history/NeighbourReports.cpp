#include "history/NeighbourReports.h"

#include <algorithm>
#include <limits>

#include "history/ServingValues.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

using V = MetricValidator;

struct NeighbourList {
  std::int64_t metric;
  Technology technology;
  Name list;
  Name channel;
  Name code;
  Name level;
  Name quality;  // empty: there is none
};

constexpr std::array kLists = {
    NeighbourList{V::K_LTE_INTRARAT_MEAS, Technology::lte, "meas_nbr_eutra", "nbr_earfcn",
                  "nbr_phys_cell_id", "nbr_rsrp", "nbr_rsrq"},
    NeighbourList{V::K_LTE_INTERRAT_MEAS, Technology::umts, "meas_nbr_utra", "uarfcn", "psc",
                  "rscp", "ecno"},
    NeighbourList{V::K_LTE_INTERRAT_MEAS, Technology::gsm, "meas_nbr_geran", "arfcn", "bsic",
                  "rxlev", ""},
    NeighbourList{V::K_UMTS_NCELL_MEAS, Technology::umts, "meas_utra_result", "uarfcn", "psc",
                  "rscp", "ecno"},
    NeighbourList{V::K_UMTS_NCELL_MEAS, Technology::gsm, "meas_gsm_result", "arfcn", "bsic",
                  "rxlev", ""},
    NeighbourList{V::K_UMTS_NCELL_MEAS, Technology::lte, "meas_lte_result", "earfcn", "phy_cell_id",
                  "rsrp", "rsrq"},
    NeighbourList{V::K_GSM_NCELL_MEAS, Technology::gsm, "gsm_ncell_meas", "arfcn", "bsic", "rxlev",
                  ""},
    NeighbourList{V::K_GSM_NCELL_MEAS, Technology::umts, "umts_ncell_meas", "dl_uarfcn", "cpich_sc",
                  "cpich_rscp", "cpich_ecn0"},
    NeighbourList{V::K_GSM_NCELL_MEAS, Technology::lte, "lte_ncell_meas", "earfcn",
                  "physical_cell_id", "rsrp", "rsrq"},
};

constexpr std::array kOnLte = {V::K_LTE_INTRARAT_MEAS, V::K_LTE_INTERRAT_MEAS};
constexpr std::array kOnUmts = {V::K_UMTS_NCELL_MEAS};
constexpr std::array kOnGsm = {V::K_GSM_NCELL_MEAS};

// How the indexes of a technology's neighbours stand for dBm and dB (36.133, 9.1.4 and 9.1.7;
// 25.133, 9.1.1.3 and 9.1.2.3; 45.008, 8.1.4).
struct Scale {
  Quantity level;
  float lowestDbm;
  Quantity quality;
  float lowestDb;
};
constexpr Scale scaleOf(Technology technology) {
  switch (technology) {
    case Technology::lte:
      return {Quantity::lteRsrp, -140, Quantity::lteRsrq, -19.5F};
    case Technology::umts:
      return {Quantity::umtsRscp, -116, Quantity::umtsEcno, -24.5F};
    case Technology::gsm:
      return {Quantity::gsmRxlev, -110, Quantity::gsmRxlev, 0};
  }
  return {};
}

std::optional<std::uint32_t> numberAt(const Dictionary& entry, Name key) {
  const Value* value = entry.find(key.view());
  const auto number = value ? value->asUInt64() : std::nullopt;
  if (!number || *number > std::numeric_limits<std::uint32_t>::max()) return std::nullopt;
  return static_cast<std::uint32_t>(*number);
}

std::optional<float> scaledAt(const Dictionary& entry, Name key, float step, float lowest,
                              Quantity quantity) {
  const Value* value = key.empty() ? nullptr : entry.find(key.view());
  const auto number = value ? value->asFloat() : std::nullopt;
  if (!number) return std::nullopt;
  const float scaled = *number * step + lowest;
  return isPossible(quantity, scaled) ? std::optional(scaled) : std::nullopt;
}

void append(std::vector<Neighbour>& cells, const NeighbourList& row, const Dictionary& entry,
            std::uint64_t timeMs) {
  constexpr float kHalf = 0.5F;
  const Scale scale = scaleOf(row.technology);
  Neighbour cell;
  cell.technology = row.technology;
  cell.channel = numberAt(entry, row.channel);
  cell.code = numberAt(entry, row.code);
  if (!cell.channel && !cell.code) return;
  cell.levelDbm = scaledAt(entry, row.level, 1, scale.lowestDbm, scale.level);
  cell.qualityDb = scaledAt(entry, row.quality, kHalf, scale.lowestDb, scale.quality);
  cell.timeMs = timeMs;
  cells.push_back(cell);
}

}  // namespace

std::span<const std::int64_t> neighbourMetrics(Technology inUse) {
  switch (inUse) {
    case Technology::lte:
      return kOnLte;
    case Technology::umts:
      return kOnUmts;
    case Technology::gsm:
      return kOnGsm;
  }
  return {};
}

std::vector<Neighbour> neighboursIn(const JournalEntry& report) {
  std::vector<Neighbour> cells;
  const auto record = report.row->describe(report.payload);
  if (!record) return cells;
  for (const NeighbourList& row : kLists) {
    if (row.metric != report.row->identifier) continue;
    const Value* value = record->find(row.list.view());
    const List* list = value ? value->asList() : nullptr;
    if (!list) continue;
    for (const Value& entry : *list) {
      if (const Dictionary* cell = entry.asDictionary())
        append(cells, row, *cell, report.receivedMs);
    }
  }
  return cells;
}

}  // namespace qel
