#include "history/ReportedCell.h"

#include <algorithm>

#include "metrics/MetricValidator.h"

namespace qel {
namespace {

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

std::optional<std::uint32_t> orNone(std::uint32_t number) {
  return number == ReportedCell::kNone ? std::nullopt : std::optional(number);
}

// No code has more than three digits (23.003, clause 2.2).
std::string digits(std::uint32_t number, std::size_t atLeast) {
  constexpr std::uint32_t kMost = 999;
  if (number > kMost) return {};
  std::string text = std::to_string(number);
  if (text.size() < atLeast) text.insert(0, atLeast - text.size(), '0');
  return text;
}

std::uint32_t numberIn(const Dictionary& record, KnownPlace& place) {
  const Value* value = place.in(record);
  const auto number = value ? value->asUInt64() : std::nullopt;
  return number && *number < ReportedCell::kNone ? static_cast<std::uint32_t>(*number)
                                                 : ReportedCell::kNone;
}

}  // namespace

Cell ReportedCell::asCell() const {
  Cell cell;
  cell.technology = technology;
  cell.channel = orNone(channel);
  cell.code = orNone(code);
  cell.cellId = orNone(cellId);
  cell.area = orNone(area);
  cell.mcc = digits(mcc, 3);
  cell.mnc = digits(mnc, hasThreeDigits ? 3 : 2);
  return cell;
}

CellReader::CellReader()
    : _places{
          {MetricValidator::K_LTE_SCELL_INFO, Technology::lte, KnownPlace("dl_freq"),
           KnownPlace("phy_cell_id"), KnownPlace("cell_id"), KnownPlace("tracking_area_code"),
           KnownPlace("sel_plmn_mcc"), KnownPlace("sel_plmn_mnc"), KnownPlace("num_mnc_digits")},
          {MetricValidator::K_UMTS_SCELL_INFO, Technology::umts, KnownPlace("dl_uarfcn"),
           KnownPlace("psc"), KnownPlace("cell_id"), KnownPlace("lac"), KnownPlace("mcc"),
           KnownPlace("mnc"), KnownPlace("num_mnc_digits")},
          {MetricValidator::K_GSM_SCELL_INFO, Technology::gsm, KnownPlace("arfcn"),
           KnownPlace("bsic"), KnownPlace("cell_id"), KnownPlace("lac"), KnownPlace("mcc"),
           KnownPlace("mnc"), KnownPlace("num_mnc_digits")}} {}

std::optional<ReportedCell> CellReader::read(std::int64_t metric, const Dictionary& record) {
  const auto places = std::ranges::find(_places, metric, &Places::metric);
  if (places == _places.end()) return std::nullopt;
  ReportedCell cell;
  cell.technology = places->technology;
  cell.channel = numberIn(record, places->channel);
  cell.code = numberIn(record, places->code);
  cell.cellId = numberIn(record, places->cellId);
  constexpr auto kNone = ReportedCell::kNone;
  if (cell.channel == kNone && cell.code == kNone && cell.cellId == kNone) return std::nullopt;
  cell.area = numberIn(record, places->area);
  cell.mcc = numberIn(record, places->mcc);
  cell.mnc = numberIn(record, places->mnc);
  cell.hasThreeDigits = numberIn(record, places->mncDigits) == 3;
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
