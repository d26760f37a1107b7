#include "fleet/NumberBoard.h"

#include <algorithm>

#include "fleet/Families.h"
#include "history/Happening.h"

namespace qel::fleet {
namespace {

using prometheus::ClientMetric;
using prometheus::MetricFamily;
using prometheus::MetricType;

ClientMetric labelled(MetricType type, const NumberBoard::Labels& labels, double value) {
  ClientMetric metric = oneNumber(type, value);
  for (const auto& [name, text] : labels) metric.label.push_back({name, text});
  return metric;
}

std::uint64_t ageMs(std::uint64_t timeMs, std::uint64_t nowMs) {
  return nowMs - std::min(nowMs, timeMs);
}

}  // namespace

NumberBoard::NumberBoard(std::chrono::milliseconds stale)
    : _staleMs(static_cast<std::uint64_t>(stale.count())) {
  // From the start, for a counter that begins with its first event hides that one.
  for (const HappeningKind kind : kHappeningKinds) _happenings.emplace(nameOf(kind), 0);
  for (const char* move : {"handover", "reselection"}) _happenings.emplace(move, 0);
}

NumberBoard::~NumberBoard() = default;

void NumberBoard::set(std::string_view family, std::string_view help, Numbers numbers,
                      std::uint64_t timeMs) {
  const std::lock_guard lock(_mutex);
  if (numbers.size() > kMostSeries) {
    _leftOut += numbers.size() - kMostSeries;
    numbers.erase(std::next(numbers.begin(), kMostSeries), numbers.end());
  }
  auto found = _families.find(family);
  if (found == _families.end()) {
    found = _families.emplace(family, Family{std::string(help), {}, 0}).first;
  }
  found->second.numbers = std::move(numbers);
  found->second.timeMs = timeMs;
}

void NumberBoard::drop(std::string_view family) {
  const std::lock_guard lock(_mutex);
  const auto found = _families.find(family);
  if (found != _families.end()) _families.erase(found);
}

void NumberBoard::countReport(std::string_view metric, std::uint64_t timeMs) {
  const std::lock_guard lock(_mutex);
  auto found = _reports.find(metric);
  if (found == _reports.end()) {
    const bool hasRoom = _reports.size() < kMostMetrics;
    found = _reports.try_emplace(std::string(hasRoom ? metric : "other")).first;
  }
  ++found->second.count;
  found->second.lastMs = timeMs;
}

void NumberBoard::countHappening(std::string_view kind) {
  const std::lock_guard lock(_mutex);
  const auto found = _happenings.find(kind);
  if (found != _happenings.end()) ++found->second;
}

void NumberBoard::countUndecodable() {
  const std::lock_guard lock(_mutex);
  ++_undecodable;
}

void NumberBoard::countDropped() {
  const std::lock_guard lock(_mutex);
  ++_dropped;
}

std::vector<MetricFamily> NumberBoard::families(std::uint64_t nowMs) const {
  const std::lock_guard lock(_mutex);
  std::vector<MetricFamily> told;
  for (const auto& [name, family] : _families) {
    if (family.numbers.empty() || ageMs(family.timeMs, nowMs) > _staleMs) continue;
    MetricFamily& each = told.emplace_back(MetricFamily{name, family.help, MetricType::Gauge, {}});
    for (const auto& [labels, value] : family.numbers) {
      each.metric.push_back(labelled(MetricType::Gauge, labels, value));
    }
  }
  MetricFamily counts{"qelwatch_reports_total", "Reports that have come.", MetricType::Counter, {}};
  MetricFamily ages{
      "qelwatch_report_age_seconds", "How long ago the newest report came.", MetricType::Gauge, {}};
  for (const auto& [metric, reports] : _reports) {
    const Labels labels = {{"metric", metric}};
    counts.metric.push_back(
        labelled(MetricType::Counter, labels, static_cast<double>(reports.count)));
    ages.metric.push_back(labelled(MetricType::Gauge, labels,
                                   static_cast<double>(ageMs(reports.lastMs, nowMs)) / 1000));
  }
  if (!_reports.empty()) {
    told.push_back(std::move(counts));
    told.push_back(std::move(ages));
  }
  MetricFamily happenings{
      "qelwatch_happenings_total", "What happened, by its kind.", MetricType::Counter, {}};
  for (const auto& [kind, count] : _happenings) {
    happenings.metric.push_back(
        labelled(MetricType::Counter, {{"kind", kind}}, static_cast<double>(count)));
  }
  told.push_back(std::move(happenings));
  const auto add = [&told](const char* name, const char* help, std::uint64_t count) {
    told.push_back(oneFamily(name, help, MetricType::Counter, static_cast<double>(count)));
  };
  add("qelwatch_undecodable_reports_total", "Reports that nobody could decode.", _undecodable);
  add("qelwatch_exporter_dropped_total", "Events that came faster than they were taken.", _dropped);
  add("qelwatch_exporter_left_out_total", "Series of a family beyond its limit.", _leftOut);
  return told;
}

}  // namespace qel::fleet
