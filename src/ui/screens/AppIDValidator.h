// Tells whether an event belongs to this application.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "base/Value.h"

namespace qel {

class AppIDValidator {
 public:
  std::int64_t myAppID = 2;
  std::string appIDKey = "kKeyAppID";
  std::optional<std::int64_t> appID;  // of the event last looked at

  // Keeps the event's application identifier, none when it is no integer. True when it is 2.
  bool validate(const Dictionary& event);
};

}  // namespace qel
