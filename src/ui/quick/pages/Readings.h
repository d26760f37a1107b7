// A measured number as the window takes it.
#pragma once

#include <QtCore/QVariantMap>

#include "ui/pages/Reading.h"

namespace qel {

// "name", "figure", "unit", "grade" ("good", "fair", "poor" or empty), "step", "isOld", "age",
// "spoken".
QVariantMap contentOf(const Reading& reading);

}  // namespace qel
