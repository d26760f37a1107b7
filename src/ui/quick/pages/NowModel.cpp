#include "ui/quick/pages/NowModel.h"

#include <algorithm>
#include <utility>

#include "ui/quick/pages/Readings.h"
#include "ui/quick/pages/Words.h"

namespace qel {
namespace {

std::vector<RowsModel::Row> linesOf(const NowPage& page) {
  std::vector<RowsModel::Row> lines;
  for (const NowLine& line : page.lines) {
    if (line.id.empty()) continue;  // nothing is known at all
    lines.push_back(
        {shown(line.id),
         {},
         {{"text", shown(line.text)}, {"spoken", shown(line.spoken)}, {"known", line.isKnown}}});
  }
  return lines;
}

std::vector<RowsModel::Row> othersOf(const NowPage& page) {
  std::vector<RowsModel::Row> others;
  for (const auto& reading : {page.quality, page.sinr}) {
    if (!reading || reading->figure.empty()) continue;
    others.push_back({shown(reading->name), {}, contentOf(*reading)});
  }
  return others;
}

bool haveSameWords(const NowPage& a, const NowPage& b) {
  return a.reason == b.reason && a.advice == b.advice && a.badge == b.badge && a.spoken == b.spoken;
}

bool haveSameRuns(const NowPage& a, const NowPage& b) {
  const auto samePoint = [](const Point& p, const Point& q) {
    return p.timeMs == q.timeMs && p.value == q.value;
  };
  const auto sameRun = [&samePoint](const Run& r, const Run& s) {
    return std::equal(r.begin(), r.end(), s.begin(), s.end(), samePoint);
  };
  return a.runsFromMs == b.runsFromMs && a.runsToMs == b.runsToMs &&
         std::equal(a.runs.begin(), a.runs.end(), b.runs.begin(), b.runs.end(), sameRun);
}

}  // namespace

void NowModel::take(NowPage page) {
  const NowPage before = std::exchange(_page, std::move(page));
  if (before.lines != _page.lines) _lines.take(linesOf(_page));
  if (before.quality != _page.quality || before.sinr != _page.sinr) _others.take(othersOf(_page));
  if (before.level != _page.level) {
    _level = contentOf(_page.level);
    emit levelChanged();
  }
  if (!haveSameWords(before, _page)) emit changed();
  if (!haveSameRuns(before, _page)) emit runsChanged();
}

QString NowModel::reason() const { return shown(_page.reason); }
QString NowModel::advice() const { return shown(_page.advice); }
QString NowModel::badge() const { return shown(_page.badge); }
QString NowModel::spoken() const { return shown(_page.spoken); }

}  // namespace qel
