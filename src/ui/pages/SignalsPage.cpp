#include "ui/pages/SignalsPage.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "ui/pages/Charts.h"
#include "ui/pages/Marks.h"
#include "ui/pages/ReadingOf.h"
#include "ui/pages/Words.h"

namespace qel {
namespace {

constexpr std::size_t kDrawnNeighbours = 5;
constexpr std::uint64_t kOldNeighbourMs = 20 * 1000;

// Distances of labels on the time axis.
constexpr std::array<std::uint64_t, 12> kTimeSteps = {2'000,     5'000,     10'000,    30'000,
                                                      60'000,    120'000,   300'000,   600'000,
                                                      1'800'000, 3'600'000, 7'200'000, 14'400'000};
constexpr std::uint64_t kMostTimeLabels = 6;

std::vector<TimeLabel> timeLabels(std::uint64_t fromMs, std::uint64_t toMs, const TimeZone& zone) {
  const auto* found = std::ranges::find_if(
      kTimeSteps, [&](std::uint64_t step) { return (toMs - fromMs) / step < kMostTimeLabels; });
  const std::uint64_t step = found == kTimeSteps.end() ? kTimeSteps.back() : *found;
  std::vector<TimeLabel> labels;
  const std::uint64_t first = fromMs % step == 0 ? 0 : step - fromMs % step;
  for (std::uint64_t after = first; after <= toMs - fromMs; after += step) {
    const std::uint64_t time = fromMs + after;
    labels.push_back({time, step < 60'000 ? secondText(time, zone) : minuteText(time, zone)});
  }
  return labels;
}

std::string spanText(std::uint64_t spanMs) {
  const auto text = [](std::uint64_t count, const char* one, const char* many) {
    return std::to_string(count) + (count == 1 ? one : many);
  };
  constexpr std::uint64_t kMinute = 60'000;
  if (spanMs < 2 * kMinute) return text((spanMs + 500) / 1000, " second", " seconds");
  if (spanMs < 120 * kMinute) return text((spanMs + kMinute / 2) / kMinute, " minute", " minutes");
  return text((spanMs + 30 * kMinute) / (60 * kMinute), " hour", " hours");
}

NeighbourRow rowOf(const Neighbour& cell, const Viewpoint& viewpoint, std::uint64_t atMs) {
  NeighbourRow row;
  row.id = idOf(cell);
  row.name = std::string(nameOf(cell.technology)) + " " + labelOf(cell);
  if (cell.channel && cell.code) {
    row.channel = std::string(channelLabel(cell.technology)) + " " + std::to_string(*cell.channel);
  }
  const Quantity level = levelOf(cell.technology);
  if (cell.levelDbm) {
    row.level = figureText(*cell.levelDbm) + " " + std::string(factsOf(level).unit);
  }
  if (cell.qualityDb) row.quality = figureText(*cell.qualityDb) + " dB";
  const auto serving = viewpoint.history->series(level).last(atMs);
  if (cell.levelDbm && serving && viewpoint.history->technology(atMs) == cell.technology) {
    row.difference = signedText(*cell.levelDbm - serving->value) + " dB";
  }
  const std::uint64_t age = atMs - std::min(atMs, cell.timeMs);
  if (age > kOldNeighbourMs) row.age = durationText(age) + " old";
  row.spoken = row.name;
  const std::string against = row.difference.empty() ? "" : row.difference + " to the serving cell";
  for (const std::string& part : {row.channel, row.level, row.quality, against, row.age}) {
    if (!part.empty()) row.spoken += ", " + part;
  }
  return row;
}

// Of each technology the strongest.
std::vector<Neighbour> drawn(const std::vector<Neighbour>& all) {
  std::array<std::size_t, 3> counts = {};
  std::vector<Neighbour> result;
  for (const Neighbour& cell : all) {
    if (!cell.levelDbm || counts.at(static_cast<std::size_t>(cell.technology)) >= kDrawnNeighbours)
      continue;
    ++counts.at(static_cast<std::size_t>(cell.technology));
    result.push_back(cell);
  }
  return result;
}

void addNeighbours(const Viewpoint& viewpoint, const std::vector<Neighbour>& all,
                   SignalsPage& page) {
  for (const Neighbour& cell : all) {
    NeighbourRow row = rowOf(cell, viewpoint, page.toMs);
    row.hasCurve = std::ranges::any_of(page.charts, [&](const Chart& chart) {
      return std::ranges::any_of(chart.curves,
                                 [&](const Curve& curve) { return curve.id == row.id; });
    });
    page.neighbours.push_back(std::move(row));
  }
  if (page.neighbours.empty()) page.neighboursNotice = "No neighbour has been reported lately.";
}

const Curve* servingCurve(const Chart& chart) {
  const bool isThere = !chart.curves.empty() && chart.curves.back().isServing;
  return isThere ? &chart.curves.back() : nullptr;
}

std::uint64_t distance(std::uint64_t a, std::uint64_t b) { return a < b ? b - a : a - b; }

// The point nearest to a time within the run that covers it.
const Point* pointAt(const Curve& curve, std::uint64_t timeMs, std::uint64_t slackMs) {
  const Point* nearest = nullptr;
  for (const Run& run : curve.runs) {
    if (run.empty() || run.front().timeMs > timeMs + slackMs) continue;
    if (run.back().timeMs + slackMs < timeMs) continue;
    auto after = std::ranges::lower_bound(run, timeMs, {}, &Point::timeMs);
    for (const auto& each : {after == run.begin() ? after : std::prev(after), after}) {
      if (each == run.end()) continue;
      if (!nearest || distance(each->timeMs, timeMs) < distance(nearest->timeMs, timeMs)) {
        nearest = &*each;
      }
    }
  }
  return nearest;
}

}  // namespace

SignalsRange SignalsRange::zoomed(double factor, double around) const {
  SignalsRange result = *this;
  const double wanted = static_cast<double>(spanMs) * factor;
  result.spanMs = static_cast<std::uint64_t>(
      std::clamp(wanted, static_cast<double>(kShortestMs), static_cast<double>(kLongestMs)));
  const double right = 1.0 - std::clamp(around, 0.0, 1.0);
  const double kept = static_cast<double>(backMs) +
                      right * (static_cast<double>(spanMs) - static_cast<double>(result.spanMs));
  result.backMs = static_cast<std::uint64_t>(std::max(0.0, kept));
  return result;
}

SignalsRange SignalsRange::moved(double spans) const {
  SignalsRange result = *this;
  const double back = static_cast<double>(backMs) + spans * static_cast<double>(spanMs);
  result.backMs =
      static_cast<std::uint64_t>(std::clamp(back, 0.0, static_cast<double>(kLongestMs)));
  return result;
}

SignalsPage signalsPage(const Viewpoint& viewpoint, const SignalsRange& range,
                        const TimeZone& zone) {
  SignalsPage page;
  page.toMs = viewpoint.nowMs - std::min(viewpoint.nowMs, range.backMs);
  page.fromMs = page.toMs - std::min(page.toMs, range.spanMs);
  page.span = spanText(range.spanMs) + " to " + secondText(page.toMs, zone);
  page.times = timeLabels(page.fromMs, page.toMs, zone);
  page.canZoomIn = range.spanMs > SignalsRange::kShortestMs;
  page.canZoomOut = range.spanMs < SignalsRange::kLongestMs;
  page.isAtEnd = range.backMs == 0;
  const auto neighbours = viewpoint.history->neighbours(page.toMs);
  page.charts = chartsOf({viewpoint, page.fromMs, page.toMs, range.columns}, drawn(neighbours));
  page.marks = marksBetween(*viewpoint.history, page.fromMs, page.toMs);
  addNeighbours(viewpoint, neighbours, page);
  if (page.charts.empty()) {
    page.notice = "No level was reported in these " + spanText(range.spanMs) +
                  ". Curves appear with the reports of the serving cell.";
  }
  return page;
}

ReadOff readOff(const Chart& chart, std::uint64_t timeMs, const TimeZone& zone) {
  constexpr std::uint64_t kSlackMs = 2500;
  ReadOff result;
  result.timeMs = timeMs;
  const Curve* serving = servingCurve(chart);
  const Point* at = serving ? pointAt(*serving, timeMs, kSlackMs) : nullptr;
  if (at) result.timeMs = at->timeMs;
  for (const Curve& curve : chart.curves) {
    const Point* point = pointAt(curve, result.timeMs, kSlackMs);
    if (!point) continue;
    result.values.push_back({curve.id, curve.isServing ? "Serving" : curve.label,
                             figureText(point->value) + " " + chart.unit, point->value,
                             curve.isServing});
  }
  std::ranges::stable_sort(result.values, [](const auto& a, const auto& b) {
    return a.isServing != b.isServing ? a.isServing : a.value > b.value;
  });
  result.time = secondText(result.timeMs, zone);
  result.spoken = result.time;
  for (const ReadOffValue& value : result.values) {
    result.spoken += ", " + value.label + " " + value.text;
  }
  if (result.values.empty()) result.spoken += ", nothing was reported";
  return result;
}

std::optional<std::uint64_t> pointAfter(const Chart& chart, std::uint64_t timeMs) {
  const Curve* serving = servingCurve(chart);
  if (!serving) return std::nullopt;
  for (const Run& run : serving->runs) {
    const auto after = std::ranges::upper_bound(run, timeMs, {}, &Point::timeMs);
    if (after != run.end()) return after->timeMs;
  }
  return std::nullopt;
}

std::optional<std::uint64_t> pointBefore(const Chart& chart, std::uint64_t timeMs) {
  const Curve* serving = servingCurve(chart);
  if (!serving) return std::nullopt;
  for (auto run = serving->runs.rbegin(); run != serving->runs.rend(); ++run) {
    const auto at = std::ranges::lower_bound(*run, timeMs, {}, &Point::timeMs);
    if (at != run->begin()) return std::prev(at)->timeMs;
  }
  return std::nullopt;
}

}  // namespace qel
