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
  explicit State(const Limits& itsLimits)
      : limits(itsLimits),
        happenings(itsLimits.mostHappenings),
        radio(itsLimits.mostHappenings),
        journal(itsLimits.journal) {
    series.fill(Series(itsLimits.series));
  }

  // The time that counts: one that goes back is the last one.
  std::uint64_t arrive(std::uint64_t receivedMs) {
    ++version;
    return latestMs = std::max(latestMs, receivedMs);
  }
  void note(std::size_t metric, std::uint64_t receivedMs, std::uint64_t atMs);
  void follow(const Report& report);
  void plot(std::int64_t metric, const Dictionary& record, std::uint64_t atMs);

  Limits limits;
  std::uint64_t version = 0;
  std::uint64_t latestMs = 0;
  HappeningLog happenings;
  RadioFollower radio;
  RegistrationFollower registration;
  ListFollower lists;
  ReportTimes times;
  Journal journal;
  std::array<Series, kQuantities.size()> series;
};

void History::State::note(std::size_t metric, std::uint64_t receivedMs, std::uint64_t atMs) {
  const auto gap = times.note(metric, atMs);
  if (!gap) return;
  Happening happening;
  happening.timeMs = receivedMs;
  happening.kind = HappeningKind::gap;
  happening.text = "Nothing was reported for " + durationText(*gap);
  happenings.add(std::move(happening), atMs);
  for (Series& one : series) one.interrupt();
}

void History::State::follow(const Report& report) {
  switch (report.metric) {
    case V::K_LTE_SCELL_INFO:
    case V::K_UMTS_SCELL_INFO:
    case V::K_GSM_SCELL_INFO:
      return radio.followCell(report, happenings);
    case V::K_LTE_RRC_STATE:
      return radio.followLteState(report, happenings);
    case V::K_UMTS_RRC_STATE:
      return radio.followUmtsState(report, happenings);
    case V::K_LTE_EMM_CTXT:
    case V::K_CELLULAR_MM_CTXT:
    case V::K_CELLULAR_GMM_CTXT:
      return registration.follow(report, happenings);
    case V::K_CELLULAR_ACTIVE_BEARER:
      return lists.followBearers(report, happenings);
    case V::K_LTE_CA_STATUS:
      return lists.followCarriers(report, happenings);
    default:
      break;
  }
  plot(report.metric, report.record, report.atMs);
}

void History::State::plot(std::int64_t metric, const Dictionary& record, std::uint64_t atMs) {
  if (!hasServingValues(metric)) return;
  const ServingValues values = servingValues(metric, record);
  for (std::size_t i = 0; i < values.size(); ++i) {
    if (values[i]) series[i].add(atMs, *values[i]);
  }
}

History::History() : History(Limits()) {}
History::History(const Limits& limits) : _state(std::make_unique<State>(limits)) {}
History::~History() = default;

void History::metricWasStored(const StoredMetric& metric) {
  State& state = *_state;
  const std::uint64_t atMs = state.arrive(metric.receivedMs);
  const auto number = static_cast<std::size_t>(&metric.row - dispatchTable().data());
  state.note(number, metric.receivedMs, atMs);
  state.journal.add(metric.row, atMs, metric.payload);
  state.follow({metric.row.identifier, metric.record, metric.receivedMs, atMs});
}

void History::metricWasPassedOver(const PassedMetric& metric) {
  State& state = *_state;
  const std::uint64_t atMs = state.arrive(metric.receivedMs);
  if (metric.identifier == kLteLinkFailure) {
    state.times.noteOther(atMs);
    static const Dictionary kNothing;
    state.radio.followLinkFailure({metric.identifier, kNothing, metric.receivedMs, atMs},
                                  state.happenings);
  } else if (metric.identifier == kLteServingMeasurement) {
    const DispatchRow& row = lteServingMeasurementRow();
    const auto record = row.describe(metric.payload);
    if (!record) return;
    state.note(dispatchTable().size(), metric.receivedMs, atMs);
    state.journal.add(row, atMs, metric.payload);
    state.plot(metric.identifier, *record, atMs);
  } else {
    state.times.noteOther(atMs);
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
  return cell ? *cell : std::nullopt;
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

std::vector<Run> History::levels(const Neighbour& cell, std::uint64_t fromMs,
                                 std::uint64_t toMs) const {
  Series levels({.recentMs = kLatest, .mostRecent = ~std::size_t{0}});
  for (const Technology technology : {Technology::lte, Technology::umts, Technology::gsm}) {
    for (const std::int64_t metric : neighbourMetrics(technology)) {
      for (const JournalEntry& report : _state->journal.of(metric, fromMs, toMs)) {
        for (const Neighbour& named : neighboursIn(report)) {
          if (named.isSameCellAs(cell) && named.levelDbm) {
            levels.add(named.timeMs, *named.levelDbm);
          }
        }
      }
    }
  }
  return levels.between(fromMs, toMs);
}

std::optional<JournalEntry> History::lastReport(std::int64_t metric, std::uint64_t atMs) const {
  return _state->journal.last(metric, atMs);
}

std::optional<std::uint64_t> History::periodMs(std::int64_t metric, std::uint64_t atMs) const {
  const auto reports = _state->journal.newest(metric, atMs, kDistancesOfPeriod + 1);
  if (reports.size() < 2) return std::nullopt;
  std::vector<std::uint64_t> distances;
  for (std::size_t i = 1; i < reports.size(); ++i) {
    distances.push_back(reports[i - 1].receivedMs - reports[i].receivedMs);
  }
  std::ranges::nth_element(distances,
                           distances.begin() + static_cast<std::ptrdiff_t>(distances.size() / 2));
  return distances[distances.size() / 2];
}

std::optional<std::uint64_t> History::lastReceivedMs(std::uint64_t atMs) const {
  const auto last = _state->times.lastMs();
  return last && *last <= atMs ? last : _state->journal.lastMs(atMs);
}

const Journal& History::journal() const { return _state->journal; }

}  // namespace qel
