// The last two minutes of the level, drawn small.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QPointer>
#include <QtGui/QColor>
#include <QtQuick/QQuickPaintedItem>

#include "ui/quick/pages/NowModel.h"

namespace qel {

// GUI thread. Draws on every renderer, and again only when its points, its size or its colour
// changed.
class SparklineItem : public QQuickPaintedItem {
  Q_OBJECT
  QML_NAMED_ELEMENT(Sparkline)
  Q_PROPERTY(qel::NowModel* page READ page WRITE setPage NOTIFY pageChanged)
  Q_PROPERTY(QColor color READ color WRITE setColor NOTIFY colorChanged)

 public:
  using QQuickPaintedItem::QQuickPaintedItem;

  NowModel* page() const { return _page; }
  void setPage(NowModel* page);
  QColor color() const { return _color; }
  void setColor(const QColor& color);

  void paint(QPainter* painter) override;

 signals:
  void pageChanged();
  void colorChanged();

 private:
  QPointer<NowModel> _page;
  QColor _color;
};

}  // namespace qel
