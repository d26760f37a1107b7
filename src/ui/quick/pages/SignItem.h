// One of the drawn signs.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QString>
#include <QtGui/QColor>
#include <QtQuick/QQuickPaintedItem>

namespace qel {

// GUI thread. Draws on every renderer, and again only for another name, size or colour.
class SignItem : public QQuickPaintedItem {
  Q_OBJECT
  QML_NAMED_ELEMENT(Sign)
  Q_PROPERTY(QString name MEMBER _name NOTIFY looksChanged)
  Q_PROPERTY(QColor color MEMBER _color NOTIFY looksChanged)

 public:
  explicit SignItem(QQuickItem* parent = nullptr);

  void paint(QPainter* painter) override;

 signals:
  void looksChanged();

 private:
  QString _name;
  QColor _color;
};

}  // namespace qel
