#include "ui/pages/Grade.h"

namespace qel {

namespace {

Grade gradeBy(float good, float fair, float value) {
  if (value >= good) return Grade::good;
  return value >= fair ? Grade::fair : Grade::poor;
}

}  // namespace

Grade gradeOf(Quantity quantity, float value) {
  const QuantityFacts& facts = factsOf(quantity);
  return gradeBy(facts.good, facts.fair, value);
}

Grade gradeOf(const QualityScale& scale, float value) {
  return gradeBy(scale.good, scale.fair, value);
}

std::string_view nameOf(Grade grade) {
  switch (grade) {
    case Grade::unknown:
      return "";
    case Grade::poor:
      return "poor";
    case Grade::fair:
      return "fair";
    case Grade::good:
      return "good";
  }
  return "";
}

int stepOf(Quantity quantity, float value) {
  const QuantityFacts& facts = factsOf(quantity);
  const float width = facts.good - facts.fair;
  switch (gradeOf(quantity, value)) {
    case Grade::unknown:
      return 0;
    case Grade::poor:
      return value < facts.fair - width ? 1 : 2;
    case Grade::fair:
      return 3;
    case Grade::good:
      return value < facts.good + width ? 4 : 5;
  }
  return 0;
}

}  // namespace qel
