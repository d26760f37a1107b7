#include "ui/quick/pages/CurvePainter.h"

#include <QtGui/QPolygonF>
#include <algorithm>

namespace qel {

PlotArea::PlotArea(const QRectF& area, std::uint64_t fromMs, std::uint64_t toMs, float lowest,
                   float highest)
    : _area(area),
      _fromMs(static_cast<double>(fromMs)),
      _spanMs(std::max(1.0, static_cast<double>(toMs) - static_cast<double>(fromMs))),
      _lowest(lowest),
      _range(std::max(1e-3, static_cast<double>(highest) - lowest)) {}

qreal PlotArea::x(std::uint64_t timeMs) const {
  return _area.left() + (static_cast<double>(timeMs) - _fromMs) / _spanMs * _area.width();
}

qreal PlotArea::y(float value) const {
  const double share = std::clamp((value - _lowest) / _range, 0.0, 1.0);
  return _area.bottom() - share * _area.height();
}

void drawRuns(QPainter& painter, const PlotArea& plot, const std::vector<Run>& runs,
              const QColor& color, qreal width) {
  painter.setPen(QPen(color, width, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  painter.setBrush(color);
  QPolygonF line;
  for (const Run& run : runs) {
    line.clear();
    for (const Point& point : run) line << QPointF(plot.x(point.timeMs), plot.y(point.value));
    if (line.size() > 1) painter.drawPolyline(line);
    if (line.size() == 1) painter.drawEllipse(line.front(), width / 2, width / 2);
  }
}

}  // namespace qel
