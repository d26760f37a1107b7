// Who receives the converted events of the baseband manager.
#pragma once

#include <optional>

#include "base/Value.h"

namespace qel {

// Called on the main queue only.
class TeskWrapperDelegate {
 public:
  virtual ~TeskWrapperDelegate() = default;
  virtual void metricsDidUpdate(const std::optional<Dictionary>& event) = 0;
  virtual void eventsDidUpdate(const std::optional<Dictionary>& event) = 0;
};

}  // namespace qel
