// Curves as lines on a painter.
#pragma once

#include <QtCore/QRectF>
#include <QtGui/QColor>
#include <QtGui/QPainter>
#include <cstdint>
#include <vector>

#include "history/Series.h"

namespace qel {

// Where times and values stand in a rectangle. Plain value.
class PlotArea {
 public:
  PlotArea(const QRectF& area, std::uint64_t fromMs, std::uint64_t toMs, float lowest,
           float highest);

  qreal x(std::uint64_t timeMs) const;
  qreal y(float value) const;
  const QRectF& area() const { return _area; }

 private:
  QRectF _area;
  double _fromMs;
  double _spanMs;
  double _lowest;
  double _range;
};

// One line through every run and none between them; a run of one point is a dot.
void drawRuns(QPainter& painter, const PlotArea& plot, const std::vector<Run>& runs,
              const QColor& color, qreal width);

}  // namespace qel
