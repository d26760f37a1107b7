#include "tools/PageJson.h"

#include <cmath>
#include <optional>
#include <string>

#include "tools/HappeningJson.h"

namespace qel::tools {
namespace {

template <typename Number>
Value orNull(const std::optional<Number>& number) {
  return number ? Value(*number) : Value();
}
Value orNull(const std::string& text) { return text.empty() ? Value() : Value(text); }

// The number of a band that has one, else its name.
Value bandValue(const std::string& band) {
  const bool isNumber =
      !band.empty() && band.size() < 4 && band.find_first_not_of("0123456789") == std::string::npos;
  return isNumber ? Value(std::stoi(band)) : orNull(band);
}

List runsOf(const Curve& curve) {
  List runs;
  for (const Run& run : curve.runs) {
    List points;
    for (const Point& point : run) points.emplace_back(List{point.timeMs, point.value});
    runs.emplace_back(std::move(points));
  }
  return runs;
}

Dictionary chartValue(const Chart& chart) {
  List curves;
  for (const Curve& curve : chart.curves) {
    curves.emplace_back(Dictionary{{"id", curve.id},
                                   {"label", orNull(curve.label)},
                                   {"serving", curve.isServing},
                                   {"runs", runsOf(curve)}});
  }
  List labels;
  for (const AxisLabel& label : chart.labels) {
    labels.emplace_back(Dictionary{{"value", label.value}, {"grade", nameOf(label.grade)}});
  }
  const QuantityFacts& facts = factsOf(chart.quantity);
  return {{"technology", nameOf(facts.technology)},
          {"quantity", facts.name},
          {"unit", chart.unit},
          {"lowest", chart.lowest},
          {"highest", chart.highest},
          {"labels", std::move(labels)},
          {"curves", std::move(curves)}};
}

Dictionary neighbourValue(const Neighbour& cell, const Viewpoint& viewpoint, std::uint64_t atMs) {
  const auto serving = viewpoint.history->series(levelOf(cell.technology)).last(atMs);
  const bool isComparable =
      cell.levelDbm && serving && viewpoint.history->technology(atMs) == cell.technology;
  return {{"technology", nameOf(cell.technology)},
          {"channel", orNull(cell.channel)},
          {"code", orNull(cell.code)},
          {"level_dbm", orNull(cell.levelDbm)},
          {"quality_db", orNull(cell.qualityDb)},
          {"difference_db", isComparable ? Value(*cell.levelDbm - serving->value) : Value()},
          {"time_ms", cell.timeMs}};
}

}  // namespace

Dictionary asJson(const NowPage& page) {
  const Value cell = asJson(page.cell);
  const auto part = [&cell](const char* key) {
    const Value* value = cell.asDictionary() ? cell.asDictionary()->find(key) : nullptr;
    return value ? *value : Value();
  };
  return {{"technology", page.technology ? Value(nameOf(*page.technology)) : Value()},
          {"band", bandValue(page.band)},
          {"channel", part("channel")},
          {"code", part("code")},
          {"cell_id", part("cell_id")},
          {"area", part("area")},
          {"mcc", part("mcc")},
          {"mnc", part("mnc")},
          {"cell", cell},
          {"level_dbm", orNull(page.levelDbm)},
          {"quality_db", orNull(page.qualityDb)},
          {"sinr_db", orNull(page.sinrDb)},
          {"rrc", orNull(page.rrc)},
          {"carriers", orNull(page.carriers)},
          {"age_ms", orNull(page.ageMs)},
          {"reason", orNull(page.reason)}};
}

Dictionary asJson(const SignalsPage& page, const Viewpoint& viewpoint) {
  List charts;
  for (const Chart& chart : page.charts) charts.emplace_back(chartValue(chart));
  List marks;
  for (const SignalMark& mark : page.marks) {
    marks.emplace_back(Dictionary{
        {"time_ms", mark.timeMs}, {"letter", std::string(1, mark.letter)}, {"text", mark.text}});
  }
  List neighbours;
  for (const Neighbour& cell : viewpoint.history->neighbours(page.toMs)) {
    neighbours.emplace_back(neighbourValue(cell, viewpoint, page.toMs));
  }
  return {{"from_ms", page.fromMs},
          {"to_ms", page.toMs},
          {"charts", std::move(charts)},
          {"marks", std::move(marks)},
          {"neighbours", std::move(neighbours)}};
}

}  // namespace qel::tools
