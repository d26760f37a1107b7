#include "history/ReportedCell.h"

#include <algorithm>
#include <array>
#include <limits>

#include "metrics/MetricValidator.h"

namespace qel {
namespace {

struct CellKeys {
  std::int64_t metric;
  Technology technology;
  Name channel;
  Name code;
  Name area;
  Name mcc;
  Name mnc;
};

constexpr std::array kCellKeys = {
    CellKeys{MetricValidator::K_LTE_SCELL_INFO, Technology::lte, "dl_freq", "phy_cell_id",
             "tracking_area_code", "sel_plmn_mcc", "sel_plmn_mnc"},
    CellKeys{MetricValidator::K_UMTS_SCELL_INFO, Technology::umts, "dl_uarfcn", "psc", "lac", "mcc",
             "mnc"},
    CellKeys{MetricValidator::K_GSM_SCELL_INFO, Technology::gsm, "arfcn", "bsic", "lac", "mcc",
             "mnc"},
};

struct CellWords {
  std::string_view code;
  std::string_view channel;
};

constexpr CellWords wordsOf(Technology technology) {
  switch (technology) {
    case Technology::lte:
      return {"PCI", "EARFCN"};
    case Technology::umts:
      return {"PSC", "UARFCN"};
    case Technology::gsm:
      return {"BSIC", "ARFCN"};
  }
  return {};
}

std::optional<std::uint32_t> numberAt(const Dictionary& record, std::string_view key) {
  const Value* value = record.find(key);
  const auto number = value ? value->asUInt64() : std::nullopt;
  if (!number || *number > std::numeric_limits<std::uint32_t>::max()) return std::nullopt;
  return static_cast<std::uint32_t>(*number);
}

// No code has more than three digits (23.003, clause 2.2).
std::string digits(std::optional<std::uint32_t> number, std::size_t atLeast) {
  constexpr std::uint32_t kMost = 999;
  if (!number || *number > kMost) return {};
  std::string text = std::to_string(*number);
  if (text.size() < atLeast) text.insert(0, atLeast - text.size(), '0');
  return text;
}

}  // namespace

std::optional<Cell> reportedCell(std::int64_t metric, const Dictionary& record) {
  const auto keys = std::ranges::find(kCellKeys, metric, &CellKeys::metric);
  if (keys == kCellKeys.end()) return std::nullopt;
  Cell cell;
  cell.technology = keys->technology;
  cell.channel = numberAt(record, keys->channel.view());
  cell.code = numberAt(record, keys->code.view());
  cell.cellId = numberAt(record, "cell_id");
  if (!cell.channel && !cell.code && !cell.cellId) return std::nullopt;
  cell.area = numberAt(record, keys->area.view());
  cell.mcc = digits(numberAt(record, keys->mcc.view()), 3);
  const std::size_t mncDigits = numberAt(record, "num_mnc_digits") == 3U ? 3 : 2;
  cell.mnc = digits(numberAt(record, keys->mnc.view()), mncDigits);
  return cell;
}

std::string textOf(const Cell& cell) {
  const CellWords words = wordsOf(cell.technology);
  std::string text(nameOf(cell.technology));
  std::string_view between = " ";
  const auto append = [&](std::string_view word, std::optional<std::uint32_t> number) {
    if (!number) return;
    ((text += between) += word) += ' ';
    text += std::to_string(*number);
    between = ", ";
  };
  append(words.code, cell.code);
  append(words.channel, cell.channel);
  append("cell", cell.cellId);
  return text;
}

}  // namespace qel
