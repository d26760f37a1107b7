#include "ui/quick/ScreenReader.h"

#include <QtCore/QTimer>
#include <QtGui/QAccessible>

namespace qel {

void ScreenReader::enter(QQuickItem* row) const {
  if (!row || !QAccessible::isActive()) return;
  QAccessibleEvent event(row, QAccessible::Focus);
  QAccessible::updateAccessibility(&event);
}

void ScreenReader::readLast(QQuickItem* item) const {
  if (!item) return;
  QTimer::singleShot(0, item, [item] {
    if (!item->parentItem()) return;
    QQuickItem* last = item->parentItem()->childItems().constLast();
    if (last != item) item->stackAfter(last);
  });
}

}  // namespace qel
