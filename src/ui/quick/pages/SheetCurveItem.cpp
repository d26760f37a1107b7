#include "ui/quick/pages/SheetCurveItem.h"

#include <utility>

#include "ui/quick/pages/CurvePainter.h"

namespace qel {
namespace {

constexpr qreal kLineWidth = 2;

}  // namespace

void SheetCurveItem::setPage(SheetModel* page) {
  if (_page == page) return;
  if (_page) disconnect(_page, nullptr, this, nullptr);
  _page = page;
  if (page) connect(page, &SheetModel::changed, this, [this] { update(); });
  emit pageChanged();
  update();
}

void SheetCurveItem::setColor(const QColor& color) {
  if (std::exchange(_color, color) == color) return;
  emit colorChanged();
  update();
}

void SheetCurveItem::paint(QPainter* painter) {
  if (!_page || !_page->sheet()) return;
  const FieldSheet& sheet = *_page->sheet();
  const QRectF inner = boundingRect().adjusted(kLineWidth, kLineWidth, -kLineWidth, -kLineWidth);
  painter->setRenderHint(QPainter::Antialiasing);
  drawRuns(*painter,
           PlotArea(inner, sheet.curveFromMs, sheet.curveToMs, sheet.lowest, sheet.highest),
           sheet.curve, _color, kLineWidth);
}

}  // namespace qel
