#include "ui/quick/pages/ChartItem.h"

#include <QtGui/QFontMetricsF>
#include <algorithm>

#include "ui/quick/pages/Words.h"

namespace qel {
namespace {

constexpr qreal kServingWidth = 2;
constexpr qreal kNeighbourWidth = 1;
constexpr qreal kBandWidth = 4;
constexpr qreal kGap = 4;

// The last point that a curve has, where its label stands.
const Point* lastOf(const Curve& curve) {
  for (auto run = curve.runs.rbegin(); run != curve.runs.rend(); ++run) {
    if (!run->empty()) return &run->back();
  }
  return nullptr;
}

// What stands beside a neighbour's curve; of "PCI 123" the number alone where there is no room.
QString codeOf(const Curve& curve, bool isWhole) {
  const QString label = shown(curve.label);
  return isWhole ? label : label.section(u' ', -1);
}

// The value at which the band above a label ends.
float endOfBand(const Chart& chart, std::size_t label) {
  return label + 1 < chart.labels.size() ? chart.labels[label + 1].value : chart.highest;
}

}  // namespace

ChartItem::ChartItem(QQuickItem* parent) : QQuickPaintedItem(parent) {
  connect(this, &ChartItem::looksChanged, this, [this] {
    emit plotChanged();
    update();
  });
}

void ChartItem::setPage(SignalsModel* page) {
  if (_page == page) return;
  if (_page) disconnect(_page, nullptr, this, nullptr);
  _page = page;
  if (page) {
    connect(page, &SignalsModel::changed, this, [this] {
      emit plotChanged();
      update();
    });
  }
  emit pageChanged();
  update();
}

void ChartItem::geometryChange(const QRectF& now, const QRectF& before) {
  QQuickPaintedItem::geometryChange(now, before);
  emit plotChanged();
}

const Chart* ChartItem::chart() const {
  if (!_page || _chart < 0 || _chart >= _page->chartCount()) return nullptr;
  return &_page->page().charts[static_cast<std::size_t>(_chart)];
}

qreal ChartItem::AxisRoom::width(Writing writing) const {
  if (isOneColumn) return std::max(numbers, words);
  return writing == Writing::withoutWords ? numbers : words + kGap + numbers;
}

// A word stands between the numbers of its band where the band is high enough for both.
ChartItem::AxisRoom ChartItem::axisRoom(const Chart& chart) const {
  const QFontMetricsF metrics(_font);
  const qreal needed = metrics.capHeight() + metrics.height();
  const qreal height = boundingRect().height() - 2 * metrics.height();
  AxisRoom room;
  for (std::size_t i = 0; i < chart.labels.size(); ++i) {
    const AxisLabel& label = chart.labels[i];
    room.numbers = std::max(room.numbers, metrics.horizontalAdvance(shown(label.text)));
    if (label.word.empty()) continue;
    room.words = std::max(room.words, metrics.horizontalAdvance(shown(label.word)));
    const float share = (endOfBand(chart, i) - label.value) / (chart.highest - chart.lowest);
    room.isOneColumn = room.isOneColumn && static_cast<qreal>(share) * height >= needed;
  }
  return room;
}

ChartItem::Writing ChartItem::writing() const {
  const auto leavesRoom = [this](Writing writing) {
    return plotRect(writing).width() >= width() / 2;
  };
  if (leavesRoom(Writing::full)) return Writing::full;
  return leavesRoom(Writing::shortCodes) ? Writing::shortCodes : Writing::withoutWords;
}

// Left of the curves stand the thresholds and what they mean, right of them the neighbours' codes,
// above them the marks' letters and below them the times: nothing is written across a curve. Each
// moment stands at the same place in all charts of the page.
QRectF ChartItem::plotRect(Writing writing) const {
  const QFontMetricsF metrics(_font);
  qreal left = 0;
  qreal right = kGap;
  const qreal line = metrics.height();
  const QRectF area = boundingRect().adjusted(0, line, 0, -line);
  if (!_page) return area;
  for (const Chart& each : _page->page().charts) {
    left = std::max(left, axisRoom(each).width(writing));
    for (const Curve& curve : each.curves) {
      const QString code = codeOf(curve, writing == Writing::full);
      right = std::max(right, metrics.horizontalAdvance(code) + 2 * kGap);
    }
  }
  return area.adjusted(left + kBandWidth + 2 * kGap, 0, -right, 0);
}

QColor ChartItem::colorOf(Grade grade) const {
  switch (grade) {
    case Grade::good:
      return _good;
    case Grade::fair:
      return _fair;
    case Grade::poor:
      return _poor;
    case Grade::unknown:
      break;
  }
  return _lines;
}

void ChartItem::drawBands(QPainter& painter, const PlotArea& plot, const Chart& chart) const {
  const QRectF& area = plot.area();
  for (std::size_t i = 0; i < chart.labels.size(); ++i) {
    const AxisLabel& label = chart.labels[i];
    const qreal top = plot.y(endOfBand(chart, i));
    const qreal line = plot.y(label.value);
    const qreal bottom = i == 0 ? area.bottom() : line;  // below the lowest it is no better
    painter.fillRect(QRectF(area.left() - kBandWidth, top, kBandWidth, bottom - top),
                     colorOf(label.grade));
    painter.setPen(QPen(_lines, 1));
    painter.drawLine(QPointF(area.left(), line), QPointF(area.right(), line));
  }
}

// Each number at its line, and each word in the middle of its band.
void ChartItem::drawAxis(QPainter& painter, const PlotArea& plot, const Chart& chart) const {
  const QFontMetricsF metrics(_font);
  const AxisRoom room = axisRoom(chart);
  const qreal numbers = plot.area().left() - kBandWidth - kGap;
  const bool hasWords = room.isOneColumn || writing() != Writing::withoutWords;
  const qreal words = room.isOneColumn ? numbers : numbers - room.numbers - kGap;
  const auto write = [&](const std::string& text, const QColor& color, qreal right, qreal middle) {
    painter.setPen(color);
    const qreal left = right - metrics.horizontalAdvance(shown(text));
    painter.drawText(QPointF(left, middle + metrics.capHeight() / 2), shown(text));
  };
  for (std::size_t i = 0; i < chart.labels.size(); ++i) {
    const AxisLabel& label = chart.labels[i];
    write(label.text, _words, numbers, plot.y(label.value));
    if (label.word.empty() || !hasWords) continue;
    write(label.word, colorOf(label.grade), words, plot.y((label.value + endOfBand(chart, i)) / 2));
  }
}

void ChartItem::drawMarks(QPainter& painter, const PlotArea& plot) const {
  const QRectF& area = plot.area();
  const QFontMetricsF metrics(_font);
  qreal free = area.left();
  for (const SignalMark& mark : _page->page().marks) {
    const qreal x = plot.x(mark.timeMs);
    if (x < area.left() || x > area.right()) continue;
    painter.setPen(QPen(_lines, 1));
    painter.drawLine(QPointF(x, area.top()), QPointF(x, area.bottom()));
    const QString letter = QChar::fromLatin1(mark.letter);
    const qreal width = metrics.horizontalAdvance(letter);
    if (x - width / 2 < free) continue;  // letters never lie on each other
    painter.setPen(_words);
    painter.drawText(QPointF(x - width / 2, area.top() - metrics.descent()), letter);
    free = x + width;
  }
}

void ChartItem::drawTimes(QPainter& painter, const PlotArea& plot) const {
  const QRectF& area = plot.area();
  const QFontMetricsF metrics(_font);
  qreal free = 0;
  painter.setPen(_words);
  for (const TimeLabel& label : _page->page().times) {
    const QString text = shown(label.text);
    const qreal width = metrics.horizontalAdvance(text);
    const qreal x = std::clamp(plot.x(label.timeMs) - width / 2, 0.0, this->width() - width);
    if (x < free) continue;
    painter.drawText(QPointF(x, area.bottom() + metrics.ascent()), text);
    free = x + width + 2 * kGap;
  }
}

void ChartItem::drawCurves(QPainter& painter, const PlotArea& plot, const Chart& chart) const {
  const QFontMetricsF metrics(_font);
  const bool areCodesWhole = writing() == Writing::full;
  std::vector<qreal> taken;
  for (const Curve& curve : chart.curves) {
    const QColor color = curve.isServing ? _serving : _neighbours;
    drawRuns(painter, plot, curve.runs, color, curve.isServing ? kServingWidth : kNeighbourWidth);
    const Point* last = lastOf(curve);
    if (!last || curve.label.empty()) continue;
    const qreal y = plot.y(last->value);
    const auto isNear = [&](qreal other) { return std::abs(other - y) < metrics.ascent(); };
    if (std::ranges::any_of(taken, isNear)) continue;
    taken.push_back(y);
    painter.setPen(_words);
    painter.drawText(QPointF(plot.area().right() + kGap, y + metrics.ascent() / 2 - 1),
                     codeOf(curve, areCodesWhole));
  }
}

void ChartItem::paint(QPainter* painter) {
  const Chart* shownChart = chart();
  if (!shownChart) return;
  const SignalsPage& page = _page->page();
  const PlotArea plot(plotRect(), page.fromMs, page.toMs, shownChart->lowest, shownChart->highest);
  painter->setFont(_font);
  drawBands(*painter, plot, *shownChart);
  drawAxis(*painter, plot, *shownChart);
  drawTimes(*painter, plot);
  painter->setRenderHint(QPainter::Antialiasing);
  drawMarks(*painter, plot);
  drawCurves(*painter, plot, *shownChart);
}

}  // namespace qel
