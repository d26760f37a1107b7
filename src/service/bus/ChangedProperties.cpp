#include "service/bus/ChangedProperties.h"

#include <utility>

namespace qel::service {

void ChangedProperties::note(std::initializer_list<const char*> names) {
  _names.insert(names.begin(), names.end());
}

std::optional<ChangedProperties::Moment> ChangedProperties::due() const {
  if (_names.empty()) return std::nullopt;
  return _takenAt ? *_takenAt + kSpacing : Moment::min();
}

std::vector<std::string> ChangedProperties::take(Moment now) {
  const auto due = this->due();
  if (!due || now < *due) return {};
  _takenAt = now;
  const auto names = std::exchange(_names, {});
  return {names.begin(), names.end()};
}

}  // namespace qel::service
