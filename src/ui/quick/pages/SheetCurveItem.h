// The last ten minutes of a field, drawn small.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QPointer>
#include <QtGui/QColor>
#include <QtQuick/QQuickPaintedItem>

#include "ui/quick/pages/SheetModel.h"

namespace qel {

// GUI thread. Draws on every renderer, and again only when its points, its size or its colour
// changed.
class SheetCurveItem : public QQuickPaintedItem {
  Q_OBJECT
  QML_NAMED_ELEMENT(SheetCurve)
  Q_PROPERTY(qel::SheetModel* sheet READ page WRITE setPage NOTIFY pageChanged)
  Q_PROPERTY(QColor color READ color WRITE setColor NOTIFY colorChanged)

 public:
  using QQuickPaintedItem::QQuickPaintedItem;

  SheetModel* page() const { return _page; }
  void setPage(SheetModel* page);
  QColor color() const { return _color; }
  void setColor(const QColor& color);

  void paint(QPainter* painter) override;

 signals:
  void pageChanged();
  void colorChanged();

 private:
  QPointer<SheetModel> _page;
  QColor _color;
};

}  // namespace qel
