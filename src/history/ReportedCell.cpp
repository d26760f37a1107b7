#include "history/ReportedCell.h"

#include <algorithm>

#include "metrics/MetricValidator.h"
#include "radio/Networks.h"

namespace qel {
namespace {

std::optional<std::uint32_t> orNone(std::uint32_t number) {
  return number == ReportedCell::kNone ? std::nullopt : std::optional(number);
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
  const auto digits = mncDigits == 0 ? std::nullopt : std::optional<std::uint32_t>(mncDigits);
  if (mcc == 0) return cell;  // no country has it
  // A country may be known without the network.
  if (const auto network = networkOf(mcc, mnc == kNone ? 0 : mnc, digits)) {
    cell.mcc = network->mcc;
    if (mnc != kNone) cell.mnc = network->mnc;
  }
  return cell;
}

void ReportedCell::fillFrom(const ReportedCell& earlier) {
  if (area == kNone) area = earlier.area;
  if (mcc != kNone || mnc != kNone) return;
  mcc = earlier.mcc;
  mnc = earlier.mnc;
  mncDigits = earlier.mncDigits;
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
  const std::uint32_t digits = numberIn(record, places->mncDigits);
  if (digits == 2 || digits == 3) cell.mncDigits = static_cast<std::uint8_t>(digits);
  return cell;
}

PlaceWords placeWords(Technology technology) {
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

std::string textOf(const Cell& cell) {
  const PlaceWords words = placeWords(cell.technology);
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
