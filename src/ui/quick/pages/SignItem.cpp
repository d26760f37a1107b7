#include "ui/quick/pages/SignItem.h"

#include "ui/quick/pages/Signs.h"

namespace qel {

SignItem::SignItem(QQuickItem* parent) : QQuickPaintedItem(parent) {
  connect(this, &SignItem::looksChanged, this, [this] { update(); });
}

void SignItem::paint(QPainter* painter) { drawSign(*painter, boundingRect(), _name, _color); }

}  // namespace qel
