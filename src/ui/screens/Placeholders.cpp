#include "ui/screens/Placeholders.h"

#include <string>

#include "metrics/MetricStore.h"

namespace qel {

bool isPlaceholder(std::string_view name, std::string_view value) {
  static const std::string kUnfilled(placeholderList()[0].at(0).key.view());
  return name == value && (name == kTableUnknown || name == kUnfilled);
}

}  // namespace qel
