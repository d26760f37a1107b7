#include "ui/pages/Charts.h"

#include <algorithm>
#include <array>

#include "ui/pages/CurveInWords.h"
#include "ui/pages/ReadingOf.h"
#include "ui/pages/Words.h"

namespace qel {
namespace {

std::vector<Run> thinnedAll(std::vector<Run> runs, const ChartFrame& frame) {
  if (frame.columns == 0) return runs;
  for (Run& run : runs) run = thinned(run, frame.fromMs, frame.toMs, frame.columns);
  return runs;
}

// Good and fair, and as far again beyond either where such values are. A grade is named once, where
// it begins; the lowest label is always one of poor.
std::vector<AxisLabel> axisLabels(const Chart& chart) {
  const QuantityFacts& facts = factsOf(chart.quantity);
  const float width = facts.good - facts.fair;
  std::vector<AxisLabel> labels;
  for (const float value : {facts.fair - width, facts.fair, facts.good, facts.good + width}) {
    if (value < facts.lowest || value >= facts.highest) continue;
    const Grade grade = gradeOf(chart.quantity, value);
    const bool begins = labels.empty() || labels.back().grade != grade;
    labels.push_back({value, figureText(value), grade, std::string(begins ? nameOf(grade) : "")});
  }
  return labels;
}

void fitAxis(Chart& chart) {
  Axis axis = usualAxis(chart.quantity);
  for (const Curve& curve : chart.curves) axis = widened(axis, curve.runs);
  chart.lowest = axis.lowest;
  chart.highest = axis.highest;
}

void addNeighbours(const ChartFrame& frame, const std::vector<Neighbour>& neighbours,
                   Chart& chart) {
  for (const Neighbour& cell : neighbours) {
    if (levelOf(cell.technology) != chart.quantity) continue;
    auto runs = thinnedAll(frame.viewpoint.history->levels(cell, frame.fromMs, frame.toMs), frame);
    if (runs.empty()) continue;
    chart.curves.push_back(
        {.id = idOf(cell), .label = labelOf(cell), .isServing = false, .runs = std::move(runs)});
  }
}

Chart makeChart(const ChartFrame& frame, Quantity quantity,
                const std::vector<Neighbour>& neighbours) {
  const QuantityFacts& facts = factsOf(quantity);
  Chart chart;
  chart.quantity = quantity;
  chart.id = std::string(nameOf(facts.technology)) + " " + std::string(facts.name);
  chart.title = chart.id;
  chart.unit = facts.unit;
  addNeighbours(frame, neighbours, chart);
  const std::size_t others = chart.curves.size();
  auto runs = thinnedAll(
      frame.viewpoint.history->series(quantity).between(frame.fromMs, frame.toMs), frame);
  const std::string course = curveInWords(runs, chart.unit);
  if (!runs.empty()) {
    chart.curves.push_back(
        {.id = "serving", .label = "", .isServing = true, .runs = std::move(runs)});
  }
  fitAxis(chart);
  chart.labels = axisLabels(chart);
  Viewpoint end = frame.viewpoint;
  end.nowMs = frame.toMs;
  chart.newest = readingOf(end, quantity).reading;
  chart.spoken = chart.title + ", " + chart.newest.spoken;
  if (!course.empty()) chart.spoken += ", " + course;
  if (others > 0) {
    chart.spoken +=
        ", with " + std::to_string(others) + (others == 1 ? " neighbour" : " neighbours");
  }
  return chart;
}

}  // namespace

Axis usualAxis(Quantity quantity) {
  const QuantityFacts& facts = factsOf(quantity);
  const float width = facts.good - facts.fair;
  return {std::max(facts.lowest, facts.fair - 2 * width),
          std::min(facts.highest, facts.good + 2 * width)};
}

Axis widened(Axis axis, const std::vector<Run>& runs) {
  for (const Run& run : runs) {
    for (const Point& point : run) {
      axis.lowest = std::min(axis.lowest, point.value);
      axis.highest = std::max(axis.highest, point.value);
    }
  }
  return axis;
}

std::string labelOf(const Neighbour& neighbour) {
  if (neighbour.code) {
    return std::string(codeLabel(neighbour.technology)) + " " + std::to_string(*neighbour.code);
  }
  return std::string(channelLabel(neighbour.technology)) + " " +
         std::to_string(neighbour.channel.value_or(0));
}

std::string idOf(const Neighbour& neighbour) {
  const auto number = [](const std::optional<std::uint32_t>& value) {
    return value ? std::to_string(*value) : std::string("-");
  };
  return std::string(nameOf(neighbour.technology)) + " " + number(neighbour.channel) + " " +
         number(neighbour.code);
}

Run thinned(const Run& run, std::uint64_t fromMs, std::uint64_t toMs, unsigned columns) {
  constexpr std::size_t kPointsOfAColumn = 4;
  if (columns == 0 || toMs <= fromMs || run.size() <= kPointsOfAColumn) return run;
  const std::uint64_t width = std::max<std::uint64_t>(1, (toMs - fromMs) / columns);
  Run result;
  result.reserve(std::min(run.size(), (columns + std::size_t{1}) * kPointsOfAColumn));
  for (auto first = run.begin(); first != run.end();) {
    const std::uint64_t column = first->timeMs / width;
    const auto last = std::find_if(
        first, run.end(), [&](const Point& point) { return point.timeMs / width != column; });
    if (static_cast<std::size_t>(last - first) <= kPointsOfAColumn) {
      result.insert(result.end(), first, last);
    } else {
      const auto [low, high] = std::minmax_element(
          first, last, [](const Point& a, const Point& b) { return a.value < b.value; });
      std::array kept = {first, std::min(low, high), std::max(low, high), std::prev(last)};
      const auto end = std::unique(kept.begin(), kept.end());
      std::for_each(kept.begin(), end, [&](const auto& point) { result.push_back(*point); });
    }
    first = last;
  }
  return result;
}

std::vector<Chart> chartsOf(const ChartFrame& frame, const std::vector<Neighbour>& neighbours) {
  std::vector<Chart> charts;
  for (const Quantity quantity : kQuantities) {
    Chart chart = makeChart(frame, quantity, neighbours);
    if (!chart.curves.empty()) charts.push_back(std::move(chart));
  }
  const auto used = frame.viewpoint.history->technology(frame.toMs);
  std::ranges::stable_partition(charts, [&](const Chart& chart) {
    return used && factsOf(chart.quantity).technology == *used;
  });
  return charts;
}

}  // namespace qel
