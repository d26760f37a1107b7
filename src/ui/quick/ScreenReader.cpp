#include "ui/quick/ScreenReader.h"

#include <QtGui/QAccessible>

namespace qel {

void ScreenReader::enter(QQuickItem* row) const {
  if (!row || !QAccessible::isActive()) return;
  QAccessibleEvent event(row, QAccessible::Focus);
  QAccessible::updateAccessibility(&event);
}

}  // namespace qel
