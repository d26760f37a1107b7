#include "fleet/LatestNumbers.h"

#include <algorithm>
#include <array>
#include <string>
#include <string_view>
#include <utility>

#include "fleet/MetricNames.h"
#include "history/NeighbourReports.h"
#include "history/ReportedCell.h"
#include "history/ServingValues.h"
#include "messages/catalogue/KBBMetricUtility.h"
#include "recording/EventLine.h"
#include "recording/RecordedMetric.h"

namespace qel::fleet {
namespace {

using Labels = NumberBoard::Labels;
using Numbers = NumberBoard::Numbers;

constexpr std::string_view kCellFamily = "qelwatch_serving_cell_info";

// No more than what the newest numbers are made of.
History::Limits fewLimits() {
  History::Limits limits;
  limits.series = {.recentMs = 60'000, .mostRecent = 64, .dayMs = 60'000, .dayStepMs = 30'000};
  limits.journal = {.ageMs = 60'000, .bytes = 512 * 1024};
  limits.mostHappenings = 1000;
  limits.mostNeighbourReports = 256;
  return limits;
}

struct LevelFamily {
  std::string name;
  std::string help;
};

// qelwatch_lte_rsrp_dbm, or of others qelwatch_lte_neighbour_rsrp_dbm.
LevelFamily makeFamily(Quantity quantity, bool isOfNeighbours) {
  const QuantityFacts& facts = factsOf(quantity);
  std::string quantityWord = asWords(facts.name);
  std::erase(quantityWord, '_');
  const std::string words =
      asWords(nameOf(facts.technology)) + (isOfNeighbours ? "_neighbour_" : "_") + quantityWord;
  const auto name = numberName(words, facts.unit);
  const std::string whose = isOfNeighbours ? " of a neighbour" : " of the serving cell";
  return {name ? name->text : "", std::string(facts.name) + whose + ", as reported last."};
}

const LevelFamily& familyOf(Quantity quantity, bool isOfNeighbours) {
  static const auto kFamilies = [] {
    std::array<std::array<LevelFamily, 2>, kQuantities.size()> families;
    for (const Quantity each : kQuantities) {
      auto& both = families.at(static_cast<std::size_t>(each));
      both = {makeFamily(each, false), makeFamily(each, true)};
    }
    return families;
  }();
  return kFamilies.at(static_cast<std::size_t>(quantity)).at(isOfNeighbours ? 1 : 0);
}

// Neighbours are reported with a level and, but for those of GSM, with this.
std::optional<Quantity> neighbourQuality(Technology technology) {
  if (technology == Technology::lte) return Quantity::lteRsrq;
  if (technology == Technology::umts) return Quantity::umtsEcno;
  return std::nullopt;
}

template <class CellLike>
Labels placeLabels(const CellLike& cell) {
  const PlaceWords words = placeWords(cell.technology);
  Labels labels;
  if (cell.code) labels.emplace_back(asWords(words.code), std::to_string(*cell.code));
  if (cell.channel) labels.emplace_back(asWords(words.channel), std::to_string(*cell.channel));
  return labels;
}

Labels cellLabels(const Cell& cell) {
  Labels labels = {{"technology", asWords(nameOf(cell.technology))}};
  if (!cell.mcc.empty()) labels.emplace_back("mcc", cell.mcc);
  if (!cell.mnc.empty()) labels.emplace_back("mnc", cell.mnc);
  if (cell.area) labels.emplace_back("area", std::to_string(*cell.area));
  if (cell.cellId) labels.emplace_back("cell", std::to_string(*cell.cellId));
  for (auto& label : placeLabels(cell)) labels.push_back(std::move(label));
  return labels;
}

bool isNeighbourMetric(std::int64_t metric) {
  for (const Technology technology : {Technology::lte, Technology::umts, Technology::gsm}) {
    const auto metrics = neighbourMetrics(technology);
    if (std::ranges::find(metrics, metric) != metrics.end()) return true;
  }
  return false;
}

std::string_view kindOf(const Happening& happening) {
  if (happening.move == CellMove::handover) return "handover";
  if (happening.move == CellMove::reselection) return "reselection";
  return nameOf(happening.kind);
}

}  // namespace

LatestNumbers::LatestNumbers(NumberBoard& board)
    : _board(board), _history(fewLimits()), _dispatcher(this) {}

LatestNumbers::~LatestNumbers() = default;

void LatestNumbers::take(const RecordedEvent& event) {
  if (event.kind != RecordedKind::metric) return;
  if (!hasReadableForm(event) || !QuietDispatcher::isReadable(event.entries)) {
    _board.countUndecodable();
    return;
  }
  _board.countReport(metricNameOf(event), event.timeMs);
  _dispatcher.take(event.entries, event.timeMs);
  if (const MetricMessage* message = messageOf(event.entries)) {
    _fields.tell(message->identifier, payloadOf(event.entries), event.timeMs, _board);
  }
  countHappenings();
}

void LatestNumbers::metricWasStored(const StoredMetric& metric) {
  _history.metricWasStored(metric);
  tellServing(metric.receivedMs, ServingReader::placeOf(metric.row.identifier).has_value());
  if (isNeighbourMetric(metric.row.identifier)) tellNeighbours(metric.receivedMs);
}

void LatestNumbers::metricWasPassedOver(const PassedMetric& metric) {
  _history.metricWasPassedOver(metric);
  tellServing(metric.receivedMs, ServingReader::placeOf(metric.identifier).has_value());
}

void LatestNumbers::tellServing(std::uint64_t timeMs, bool hasLevels) {
  const auto cell = _history.servingCell(History::kLatest);
  const bool isSame = cell ? _cell && cell->isSameAs(*_cell) : !_cell;
  bool isFresh = !isSame;
  for (const Quantity quantity : kQuantities) {
    const auto last = _history.series(quantity).last(History::kLatest);
    const LevelFamily& family = familyOf(quantity, false);
    if (hasLevels && last && last->timeMs == timeMs) {
      const bool isItsCell = cell && cell->technology == factsOf(quantity).technology;
      _board.set(family.name, family.help,
                 {{isItsCell ? placeLabels(*cell) : Labels(), widened(last->value)}}, timeMs);
      isFresh = true;
    } else if (!isSame) {
      _board.drop(family.name);  // of a cell that is gone
    }
  }
  _cell = cell;
  if (!cell) {
    _board.drop(kCellFamily);
  } else if (isFresh) {
    _board.set(kCellFamily, "The cell that the phone is on.", {{cellLabels(*cell), 1}}, timeMs);
  }
}

void LatestNumbers::tellNeighbours(std::uint64_t timeMs) {
  const auto neighbours = _history.neighbours(History::kLatest);
  for (const Quantity quantity : kQuantities) {
    const Technology technology = factsOf(quantity).technology;
    const bool isLevel = levelOf(technology) == quantity;
    if (!isLevel && neighbourQuality(technology) != quantity) continue;
    Numbers numbers;
    for (const Neighbour& neighbour : neighbours) {
      const auto& value = isLevel ? neighbour.levelDbm : neighbour.qualityDb;
      if (neighbour.technology != technology || !value) continue;
      numbers.try_emplace(placeLabels(neighbour), widened(*value));
    }
    const LevelFamily& family = familyOf(quantity, true);
    _board.set(family.name, family.help, std::move(numbers), timeMs);
  }
}

void LatestNumbers::countHappenings() {
  const auto& happenings = _history.happenings();
  const std::uint64_t gone = _history.happeningsGone();
  const std::uint64_t from = std::max(_happeningsTold, gone) - gone;
  for (std::size_t i = static_cast<std::size_t>(from); i < happenings.size(); ++i) {
    _board.countHappening(kindOf(happenings[i]));
  }
  _happeningsTold = gone + happenings.size();
}

}  // namespace qel::fleet
