#include "ui/quick/pages/SparklineItem.h"

#include <utility>

#include "ui/quick/pages/CurvePainter.h"

namespace qel {
namespace {

constexpr qreal kLineWidth = 2;

}  // namespace

void SparklineItem::setPage(NowModel* page) {
  if (_page == page) return;
  if (_page) disconnect(_page, nullptr, this, nullptr);
  _page = page;
  if (page) connect(page, &NowModel::runsChanged, this, [this] { update(); });
  emit pageChanged();
  update();
}

void SparklineItem::setColor(const QColor& color) {
  if (std::exchange(_color, color) == color) return;
  emit colorChanged();
  update();
}

void SparklineItem::paint(QPainter* painter) {
  if (!_page) return;
  const NowPage& page = _page->page();
  const QRectF inner = boundingRect().adjusted(kLineWidth, kLineWidth, -kLineWidth, -kLineWidth);
  painter->setRenderHint(QPainter::Antialiasing);
  drawRuns(*painter, PlotArea(inner, page.runsFromMs, page.runsToMs, page.lowest, page.highest),
           page.runs, _color, kLineWidth);
}

}  // namespace qel
