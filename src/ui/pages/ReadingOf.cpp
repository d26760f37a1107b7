#include "ui/pages/ReadingOf.h"

#include <algorithm>
#include <vector>

#include "ui/pages/Words.h"

namespace qel {
namespace {

constexpr std::uint64_t kUsualPeriodMs = 10 * 1000;  // while too little is known
constexpr std::uint64_t kShortestPeriodMs = 1000;    // below it no eye sees an age

std::uint64_t startOfGlance(std::uint64_t nowMs) { return nowMs - std::min(nowMs, kGlanceMs); }

void setAge(const Viewpoint& viewpoint, std::uint64_t oldAfter, MadeReading& made) {
  if (viewpoint.nowMs < made.point->timeMs) return;
  const std::uint64_t age = viewpoint.nowMs - made.point->timeMs;
  made.reading.isOld = age > oldAfter;
  if (made.reading.isOld) made.reading.age = durationText(age) + " old";
  if (!viewpoint.isLive) return;
  made.changesAtMs = made.point->timeMs + (made.reading.isOld ? nextDurationMs(age) : oldAfter + 1);
}

}  // namespace

std::uint64_t oldAfterMs(const std::vector<Run>& runs) {
  std::vector<std::uint64_t> distances;
  std::size_t points = 0;
  for (const Run& run : runs) points += run.size();
  distances.reserve(points);
  for (const Run& run : runs) {
    for (std::size_t i = 1; i < run.size(); ++i) {
      const auto distance = run[i].timeMs - run[i - 1].timeMs;
      if (distance > 0) distances.push_back(distance);
    }
  }
  if (distances.empty()) return 2 * kUsualPeriodMs;
  const auto middle = distances.begin() + static_cast<std::ptrdiff_t>(distances.size() / 2);
  std::ranges::nth_element(distances, middle);
  return 2 * std::max(*middle, kShortestPeriodMs);
}

MadeReading readingOf(const Viewpoint& viewpoint, Quantity quantity) {
  MadeReading made;
  Reading& reading = made.reading;
  const QuantityFacts& facts = factsOf(quantity);
  reading.quantity = quantity;
  reading.name = facts.name;
  reading.unit = facts.unit;
  const Series& series = viewpoint.history->series(quantity);
  made.point = series.last(viewpoint.nowMs);
  if (!made.point) {
    reading.spoken = reading.name + " not reported";
    return made;
  }
  const float value = made.point->value;
  reading.figure = figureText(value);
  reading.grade = gradeOf(quantity, value);
  reading.word = nameOf(reading.grade);
  reading.step = stepOf(quantity, value);
  setAge(viewpoint, oldAfterMs(series.between(startOfGlance(viewpoint.nowMs), viewpoint.nowMs)),
         made);
  reading.spoken = reading.name + " " + reading.figure + " " + reading.unit + ", " + reading.word;
  if (reading.isOld) reading.spoken += ", " + reading.age;
  return made;
}

}  // namespace qel
