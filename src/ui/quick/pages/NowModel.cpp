#include "ui/quick/pages/NowModel.h"

#include <algorithm>
#include <utility>

#include "ui/quick/pages/Readings.h"
#include "ui/quick/pages/Words.h"

namespace qel {
namespace {

QVariantList linesOf(const NowPage& page) {
  QVariantList lines;
  for (const NowLine& line : page.lines) {
    lines << QVariantMap{{"id", shown(line.id)},
                         {"text", shown(line.text)},
                         {"spoken", shown(line.spoken)},
                         {"known", line.isKnown}};
  }
  return lines;
}

QVariantList othersOf(const NowPage& page) {
  QVariantList others;
  for (const auto& reading : {page.quality, page.sinr}) {
    if (reading && !reading->figure.empty()) others << contentOf(*reading);
  }
  return others;
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
  const bool sameRuns = haveSameRuns(_page, page);
  _page = std::move(page);
  _lines = linesOf(_page);
  _level = contentOf(_page.level);
  _others = othersOf(_page);
  emit changed();
  if (!sameRuns) emit runsChanged();
}

QString NowModel::reason() const { return shown(_page.reason); }
QString NowModel::advice() const { return shown(_page.advice); }
QString NowModel::badge() const { return shown(_page.badge); }
QString NowModel::spoken() const { return shown(_page.spoken); }

}  // namespace qel
