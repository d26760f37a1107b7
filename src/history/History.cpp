#include "history/History.h"

#include <algorithm>
#include <utility>

#include "history/HappeningLog.h"
#include "history/ListFollower.h"
#include "history/NeighbourReports.h"
#include "history/PassedMetrics.h"
#include "history/RadioFollower.h"
#include "history/RegistrationFollower.h"
#include "history/ReportTimes.h"
#include "history/ServingValues.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

using V = MetricValidator;

// What one list leaves out another one of these times may name.
constexpr std::uint64_t kListsTogetherMs = 10'000;
constexpr std::size_t kDistancesOfPeriod = 8;

// What follows from reports of a metric, besides its place in the journal.
enum class Handling : std::uint8_t {
  none,
  cell,
  lteState,
  umtsState,
  registration,
  bearers,
  carriers,
};

Handling handlingOf(std::int64_t metric) {
  switch (metric) {
    case V::K_LTE_SCELL_INFO:
    case V::K_UMTS_SCELL_INFO:
    case V::K_GSM_SCELL_INFO:
      return Handling::cell;
    case V::K_LTE_RRC_STATE:
      return Handling::lteState;
    case V::K_UMTS_RRC_STATE:
      return Handling::umtsState;
    case V::K_LTE_EMM_CTXT:
    case V::K_CELLULAR_MM_CTXT:
    case V::K_CELLULAR_GMM_CTXT:
      return Handling::registration;
    case V::K_CELLULAR_ACTIVE_BEARER:
      return Handling::bearers;
    case V::K_LTE_CA_STATUS:
      return Handling::carriers;
    default:
      return Handling::none;
  }
}

// By the place of a metric in the dispatch table.
struct Way {
  static constexpr std::uint8_t kNone = 255;
  Handling handling = Handling::none;
  std::uint8_t serving = kNone;  // for the reader of serving values
};
using Ways = std::array<Way, ReportTimes::kMetrics>;

Ways waysOf(std::span<const DispatchRow> rows) {
  Ways ways;
  for (std::size_t i = 0; i < rows.size(); ++i) {
    ways.at(i).handling = handlingOf(rows[i].identifier);
    const auto place = ServingReader::placeOf(rows[i].identifier);
    if (place) ways.at(i).serving = static_cast<std::uint8_t>(*place);
  }
  return ways;
}

std::string durationText(std::uint64_t ms) {
  const std::uint64_t seconds = ms / 1000;
  if (seconds < 60) return std::to_string(seconds) + " s";
  if (seconds < 3600) {
    return std::to_string(seconds / 60) + " min " + std::to_string(seconds % 60) + " s";
  }
  return std::to_string(seconds / 3600) + " h " + std::to_string(seconds / 60 % 60) + " min";
}

}  // namespace

struct History::State {
  explicit State(const Limits& limits)
      : mostNeighbourReports(limits.mostNeighbourReports),
        happenings(limits.mostHappenings),
        radio(limits.mostHappenings),
        journal(limits.journal) {
    for (Series& one : series) one = Series(limits.series);
    for (const DispatchRow& row : dispatchTable()) journal.know(row);
    measurements = journal.know(lteServingMeasurementRow());
  }

  // The time that counts: one that goes back is the last one.
  std::uint64_t arrive(std::uint64_t receivedMs) {
    ++version;
    return latestMs = std::max(latestMs, receivedMs);
  }
  auto plotter() {
    return [this](Quantity quantity, float value) {
      series.data()[static_cast<std::size_t>(quantity)].add(latestMs, value);
    };
  }
  static const Dictionary& noRecord() {
    static const Dictionary kNone;
    return kNone;
  }

  // These three are apart from what is done for every report. The gap comes before the report that
  // ends it.
  [[gnu::noinline]] void addGap(std::uint64_t silenceMs, std::int64_t metric,
                                std::uint64_t receivedMs);
  [[gnu::noinline]] void follow(const StoredMetric& metric, Handling handling);
  [[gnu::noinline]] void plot(const StoredMetric& metric, std::size_t place) {
    serving.read(place, metric.record, plotter());
  }

  struct Measured {
    std::uint64_t version;
    std::uint64_t fromMs;
    std::uint64_t toMs;
    std::vector<Neighbour> cells;
  };
  const std::vector<Neighbour>& measured(std::uint64_t fromMs, std::uint64_t toMs);

  const std::size_t mostNeighbourReports;
  std::optional<Measured> neighbours;  // of the times asked for last
  const DispatchRow* const rows = dispatchTable().data();
  const Ways ways = waysOf(dispatchTable());
  std::size_t measurements = 0;  // the number of kLteServingMeasurement
  std::uint64_t version = 0;
  std::uint64_t latestMs = 0;
  HappeningLog happenings;
  RadioFollower radio;
  RegistrationFollower registration;
  ListFollower lists;
  ReportTimes times;
  Journal journal;
  ServingReader serving;
  std::array<Series, kQuantities.size()> series;
};

void History::State::addGap(std::uint64_t silenceMs, std::int64_t metric,
                            std::uint64_t receivedMs) {
  happenings.tellText({metric, noRecord(), receivedMs, latestMs}, HappeningKind::gap, std::nullopt,
                      "Nothing was reported for " + durationText(silenceMs));
  for (Series& one : series) one.interrupt();
}

void History::State::follow(const StoredMetric& metric, Handling handling) {
  const Report report{metric.row.identifier, metric.record, metric.receivedMs, latestMs};
  switch (handling) {
    case Handling::none:
      break;
    case Handling::cell:
      radio.followCell(report, happenings);
      break;
    case Handling::lteState:
      radio.followLteState(report, happenings);
      break;
    case Handling::umtsState:
      radio.followUmtsState(report, happenings);
      break;
    case Handling::registration:
      registration.follow(report, happenings);
      break;
    case Handling::bearers:
      lists.followBearers(report, happenings);
      break;
    case Handling::carriers:
      lists.followCarriers(report, happenings);
      break;
  }
}

History::History() : History(Limits()) {}
History::History(const Limits& limits) : _state(std::make_unique<State>(limits)) {}
History::~History() = default;

void History::metricWasStored(const StoredMetric& metric) {
  State& state = *_state;
  const std::uint64_t atMs = state.arrive(metric.receivedMs);
  const auto number = static_cast<std::size_t>(&metric.row - state.rows);
  const std::uint64_t silenceMs = state.times.note(number, atMs);
  if (silenceMs != 0) [[unlikely]]
    state.addGap(silenceMs, metric.row.identifier, metric.receivedMs);
  state.journal.add(number, atMs, metric.payload);
  const Way way = state.ways.data()[number];
  if (way.serving != Way::kNone) state.plot(metric, way.serving);
  if (way.handling != Handling::none) state.follow(metric, way.handling);
}

void History::metricWasPassedOver(const PassedMetric& metric) {
  State& state = *_state;
  const std::uint64_t atMs = state.arrive(metric.receivedMs);
  std::optional<ServingReader::Measurement> measurement;
  if (metric.identifier == kLteServingMeasurement) {
    measurement = ServingReader::readMeasurement(metric.payload);
  }
  const std::uint64_t silenceMs =
      measurement ? state.times.note(state.measurements, atMs) : state.times.noteOther(atMs);
  if (silenceMs != 0) state.addGap(silenceMs, metric.identifier, metric.receivedMs);
  if (measurement) {
    state.journal.add(state.measurements, atMs, metric.payload);
    ServingReader::tell(*measurement, state.plotter());
  } else if (metric.identifier == kLteLinkFailure) {
    state.radio.followLinkFailure({metric.identifier, State::noRecord(), metric.receivedMs, atMs},
                                  state.happenings);
  }
}

void History::add(Happening happening) {
  State& state = *_state;
  const std::uint64_t atMs = state.arrive(happening.timeMs);
  if (happening.kind != HappeningKind::mark) {
    state.times.forget();
    for (Series& one : state.series) one.interrupt();
  }
  state.happenings.add(std::move(happening), atMs);
}

std::uint64_t History::version() const { return _state->version; }

const std::deque<Happening>& History::happenings() const { return _state->happenings.all(); }

std::uint64_t History::happeningsGone() const { return _state->happenings.gone(); }

std::size_t History::happeningsUntil(std::uint64_t atMs) const {
  return _state->happenings.until(atMs);
}

const Series& History::series(Quantity quantity) const {
  return _state->series.at(static_cast<std::size_t>(quantity));
}

std::optional<Cell> History::servingCell(std::uint64_t atMs) const {
  const auto* cell = _state->radio.servingCell().at(atMs);
  return cell && *cell ? std::optional((*cell)->asCell()) : std::nullopt;
}

std::optional<Technology> History::technology(std::uint64_t atMs) const {
  const auto* technology = _state->radio.technology().at(atMs);
  return technology ? *technology : std::nullopt;
}

std::vector<Neighbour> History::neighbours(std::uint64_t atMs) const {
  std::vector<Neighbour> cells;
  const auto inUse = technology(atMs);
  if (!inUse) return cells;
  const std::uint64_t sinceMs = _state->radio.technology().since(atMs);
  const auto serving = servingCell(atMs);
  for (const std::int64_t metric : neighbourMetrics(*inUse)) {
    const auto last = _state->journal.last(metric, atMs);
    if (!last || last->receivedMs < sinceMs) continue;
    const std::uint64_t together = std::min(last->receivedMs, kListsTogetherMs);
    const std::uint64_t fromMs = std::max(sinceMs, last->receivedMs - together);
    auto reports = _state->journal.of(metric, fromMs, last->receivedMs);
    if (reports.empty()) reports.push_back(*last);
    for (auto report = reports.rbegin(); report != reports.rend(); ++report) {
      const auto named = neighboursIn(*report);
      if (named.empty()) break;  // there were none
      for (const Neighbour& cell : named) {
        const auto isSame = [&](const Neighbour& known) { return known.isSameCellAs(cell); };
        if (std::ranges::none_of(cells, isSame)) cells.push_back(cell);
      }
    }
  }
  std::erase_if(cells, [&](const Neighbour& cell) {
    return serving && cell.channel && cell.code && serving->technology == cell.technology &&
           serving->channel == cell.channel && serving->code == cell.code;
  });
  std::ranges::stable_sort(cells, [&](const Neighbour& a, const Neighbour& b) {
    const bool isOwnA = a.technology == *inUse;
    const bool isOwnB = b.technology == *inUse;
    return isOwnA != isOwnB ? isOwnA : a.levelDbm > b.levelDbm;
  });
  return cells;
}

// The neighbours of all reports within both times, oldest first of each metric. Curves of several
// of them are asked for in a row.
const std::vector<Neighbour>& History::State::measured(std::uint64_t fromMs, std::uint64_t toMs) {
  if (neighbours && neighbours->version == version && neighbours->fromMs == fromMs &&
      neighbours->toMs == toMs) {
    return neighbours->cells;
  }
  neighbours = Measured{version, fromMs, toMs, {}};
  for (const Technology technology : {Technology::lte, Technology::umts, Technology::gsm}) {
    for (const std::int64_t metric : neighbourMetrics(technology)) {
      const auto reports = journal.of(metric, fromMs, toMs);
      const std::size_t skipped = reports.size() - std::min(reports.size(), mostNeighbourReports);
      for (std::size_t i = skipped; i < reports.size(); ++i) {
        const auto named = neighboursIn(reports[i]);
        neighbours->cells.insert(neighbours->cells.end(), named.begin(), named.end());
      }
    }
  }
  return neighbours->cells;
}

std::vector<Run> History::levels(const Neighbour& cell, std::uint64_t fromMs,
                                 std::uint64_t toMs) const {
  std::vector<Neighbour> measured;
  for (const Neighbour& named : _state->measured(fromMs, toMs)) {
    if (named.isSameCellAs(cell) && named.levelDbm) measured.push_back(named);
  }
  std::ranges::stable_sort(measured, {}, &Neighbour::timeMs);
  Series levels({.recentMs = kLatest, .mostRecent = ~std::size_t{0}});
  for (const Neighbour& one : measured) levels.add(one.timeMs, *one.levelDbm);
  return levels.between(fromMs, toMs);
}

std::optional<JournalEntry> History::lastReport(std::int64_t metric, std::uint64_t atMs) const {
  return _state->journal.last(metric, atMs);
}

std::optional<std::uint64_t> History::periodMs(std::int64_t metric, std::uint64_t atMs) const {
  std::array<std::uint64_t, kDistancesOfPeriod + 1> times;
  const std::size_t count = _state->journal.newestTimes(metric, atMs, times);
  if (count < 2) return std::nullopt;
  // The distances take the place of the times.
  const std::span<std::uint64_t> distances(times.data(), count - 1);
  for (std::size_t i = 0; i < distances.size(); ++i) distances[i] = times[i] - times[i + 1];
  const auto middle = distances.begin() + static_cast<std::ptrdiff_t>(distances.size() / 2);
  std::ranges::nth_element(distances, middle);
  return *middle;
}

std::optional<std::uint64_t> History::lastReceivedMs(std::uint64_t atMs) const {
  const std::uint64_t last = _state->times.lastMs();
  return last != 0 && last <= atMs ? std::optional(last) : _state->journal.lastMs(atMs);
}

const Journal& History::journal() const { return _state->journal; }

}  // namespace qel
