#include "ui/quick/pages/Readings.h"

#include "ui/quick/pages/Words.h"

namespace qel {

QVariantMap contentOf(const Reading& reading) {
  return {{"name", shown(reading.name)},    {"figure", shown(reading.figure)},
          {"unit", shown(reading.unit)},    {"grade", shown(nameOf(reading.grade))},
          {"word", shown(reading.word)},    {"step", reading.step},
          {"isOld", reading.isOld},         {"age", shown(reading.age)},
          {"spoken", shown(reading.spoken)}};
}

}  // namespace qel
