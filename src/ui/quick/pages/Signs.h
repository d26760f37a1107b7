// Small drawn signs: one for each kind of happening, and those of the buttons.
#pragma once

#include <QtCore/QRectF>
#include <QtCore/QStringView>
#include <QtGui/QColor>
#include <QtGui/QPainter>

namespace qel {

// Fills the square with the sign of this name, a happening's kind or what a button does, in one
// colour: signs are told apart by their shape. False for a name that has none; then nothing is
// drawn.
bool drawSign(QPainter& painter, const QRectF& square, QStringView name, const QColor& color);

}  // namespace qel
