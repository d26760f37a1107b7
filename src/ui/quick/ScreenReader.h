// What a screen reader is told beside the roles and names that the interface gives its items.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QObject>
#include <QtQuick/QQuickItem>

namespace qel {

// One a QML engine, GUI thread only. Costs nothing while no assistive tool runs.
class ScreenReader final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_SINGLETON

 public:
  using QObject::QObject;

  // The keyboard is now on this row, though what takes the keys is its list. Null: on none.
  Q_INVOKABLE void enter(QQuickItem* row) const;
  // Of all items that its parent has when this turn of events is over it is told last. Null:
  // nothing happens.
  Q_INVOKABLE void readLast(QQuickItem* item) const;
};

}  // namespace qel
