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

// Left of the curves stand the thresholds, right of them the neighbours' codes, above them the
// marks' letters and below them the times.
QRectF ChartItem::plotRect() const {
  const QFontMetricsF metrics(_font);
  qreal left = 0;
  qreal right = kGap;
  if (const Chart* shownChart = chart()) {
    for (const AxisLabel& label : shownChart->labels) {
      left = std::max(left, metrics.horizontalAdvance(shown(label.text)));
    }
    for (const Curve& curve : shownChart->curves) {
      right = std::max(right, metrics.horizontalAdvance(shown(curve.label)) + 2 * kGap);
    }
  }
  const qreal line = metrics.height();
  return boundingRect().adjusted(left + kBandWidth + 2 * kGap, line, -right, -line);
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
  const QFontMetricsF metrics(_font);
  for (std::size_t i = 0; i < chart.labels.size(); ++i) {
    const AxisLabel& label = chart.labels[i];
    const qreal bottom = plot.y(label.value);
    const qreal top = i + 1 < chart.labels.size() ? plot.y(chart.labels[i + 1].value) : area.top();
    const QColor color = colorOf(label.grade);
    const qreal end = i == 0 ? area.bottom() : bottom;  // below the lowest it is no better
    painter.fillRect(QRectF(area.left() - kBandWidth, top, kBandWidth, end - top), color);
    painter.setPen(QPen(_lines, 1));
    painter.drawLine(QPointF(area.left(), bottom), QPointF(area.right(), bottom));
    painter.setPen(_words);
    const QString text = shown(label.text);
    painter.drawText(QPointF(area.left() - kBandWidth - kGap - metrics.horizontalAdvance(text),
                             bottom + metrics.ascent() / 2 - 1),
                     text);
    if (label.word.empty() || bottom - top < metrics.height()) continue;
    painter.setPen(color);
    painter.drawText(QPointF(area.left() + kGap, bottom - metrics.descent()), shown(label.word));
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
                     shown(curve.label));
  }
}

void ChartItem::paint(QPainter* painter) {
  const Chart* shownChart = chart();
  if (!shownChart) return;
  const SignalsPage& page = _page->page();
  const PlotArea plot(plotRect(), page.fromMs, page.toMs, shownChart->lowest, shownChart->highest);
  painter->setFont(_font);
  drawBands(*painter, plot, *shownChart);
  drawTimes(*painter, plot);
  painter->setRenderHint(QPainter::Antialiasing);
  drawMarks(*painter, plot);
  drawCurves(*painter, plot, *shownChart);
}

}  // namespace qel
