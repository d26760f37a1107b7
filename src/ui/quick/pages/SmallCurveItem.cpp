#include "ui/quick/pages/SmallCurveItem.h"

#include "ui/quick/pages/CurvePainter.h"

namespace qel {
namespace {

constexpr qreal kLineWidth = 2;

}  // namespace

SmallCurveItem::SmallCurveItem(QQuickItem* parent) : QQuickPaintedItem(parent) {
  connect(this, &SmallCurveItem::colorChanged, this, [this] { update(); });
}

void SmallCurveItem::paint(QPainter* painter) {
  const auto drawn = curve();
  if (!drawn) return;
  const QRectF inner = boundingRect().adjusted(kLineWidth, kLineWidth, -kLineWidth, -kLineWidth);
  painter->setRenderHint(QPainter::Antialiasing);
  drawRuns(*painter, PlotArea(inner, drawn->fromMs, drawn->toMs, drawn->lowest, drawn->highest),
           drawn->runs, _color, kLineWidth);
}

}  // namespace qel
